import QtQuick
import Quorl

// The navigation stack: the container at its root, pushed screens over it or beside it, presented ones over all.
Item {
    id: root

    required property ShellBinding shell

    readonly property bool isWide: width >= Theme.wideWidth
    // List and detail side by side.
    readonly property bool isSplit: isWide && shell.currentIndex === shell.listIndex
    readonly property int listWidth: Math.min(420, Math.max(320, Math.round(width * 0.4)))
    // The pushed screens, the uppermost last. They belong to the tab from which the first was pushed.
    property var pages: []
    property int pagesTab: 0
    readonly property bool showsPages: pages.length > 0 && pagesTab === shell.currentIndex
    property var sheets: []
    readonly property bool isPresenting: sheets.length > 0
    readonly property bool canGoBack: isPresenting || showsPages

    function make(component, properties, navigation) {
        let source = component
        if (typeof component === "string")
            source = Qt.createComponent(component + ".qml")
        if (source.status === Component.Error) {
            console.warn(source.errorString())
            return null
        }
        return source.createObject(root, Object.assign({}, properties, {navigation: navigation}))
    }

    function push(component, properties, isFromRoot) {
        if (isFromRoot)
            leavePages(pages.length, false)
        const screen = make(component, properties, pageNavigation)
        if (!screen)
            return null
        const page = pageComponent.createObject(pagesArea, {shell: shell, screen: screen})
        pagesTab = shell.currentIndex
        pages = pages.concat([page])
        page.enter(!(isSplit && isFromRoot))
        return screen
    }
    function pop() {
        if (pages.length === 0)
            return
        leavePages(1, true)
        if (pages.length > 0)
            pages[pages.length - 1].forceActiveFocus()
        else
            rootDidAppear()
    }
    function popToRoot() {
        if (pages.length === 0)
            return
        leavePages(pages.length, false)
        rootDidAppear()
    }
    function leavePages(count, animated) {
        const leaving = pages.slice(pages.length - count)
        pages = pages.slice(0, pages.length - count)
        for (const page of leaving)
            page.leave(animated)
    }
    function rootDidAppear() {
        base.forceActiveFocus()
        shell.rootWillAppear()
    }

    function present(component, properties) {
        const screen = make(component, properties, sheetNavigation)
        if (!screen)
            return null
        const sheet = sheetComponent.createObject(sheetsArea, {screen: screen})
        sheets = sheets.concat([sheet])
        sheet.enter()
        return screen
    }
    function dismiss() {
        if (sheets.length === 0)
            return
        const sheet = sheets[sheets.length - 1]
        sheets = sheets.slice(0, -1)
        sheet.leave()
        if (sheets.length > 0)
            sheets[sheets.length - 1].forceActiveFocus()
        else if (showsPages)
            pages[pages.length - 1].forceActiveFocus()
        else
            base.forceActiveFocus()
    }

    // Escape, or the system's back.
    function goBack() {
        if (isPresenting)
            dismiss()
        else if (showsPages)
            pop()
    }
    function selectTab(index) {
        if (isPresenting || index >= shell.menuBar.count)
            return
        if (showsPages && !isSplit)
            popToRoot()
        shell.menuBar.press(index)
    }

    Navigation {
        id: rootNavigation

        onPushRequested: (component, properties) => root.push(component, properties, true)
        onPresentRequested: (component, properties) => root.present(component, properties)
    }
    Navigation {
        id: pageNavigation

        onPushRequested: (component, properties) => root.push(component, properties, false)
        onPopRequested: root.pop()
        onPresentRequested: (component, properties) => root.present(component, properties)
    }
    Navigation {
        id: sheetNavigation

        onPresentRequested: (component, properties) => root.present(component, properties)
        onDismissRequested: root.dismiss()
    }

    Component {
        id: pageComponent

        NavigationPage {
            id: page

            width: parent ? parent.width : 0
            height: parent ? parent.height : 0
            onBackPressed: root.pop()
            onGone: page.destroy()
        }
    }
    Component {
        id: sheetComponent

        PresentedScreen {
            id: sheet

            onGone: sheet.destroy()
        }
    }

    BaseViewController {
        id: base

        objectName: "base"
        shell: root.shell
        navigation: rootNavigation
        width: root.isSplit ? root.listWidth : root.width
        height: root.height
        focus: true
        enabled: !root.isPresenting && (root.isSplit || !root.showsPages)
    }
    Rectangle {
        visible: root.isSplit
        x: root.listWidth
        width: 1
        height: root.height
        color: Theme.line
    }
    Text {
        objectName: "emptyDetail"
        visible: root.isSplit && root.pages.length === 0
        anchors.centerIn: pagesArea
        width: Math.min(pagesArea.width - 2 * Theme.margin, 320)
        text: qsTr("No metric is open. Choose one from the list.")
        wrapMode: Text.WordWrap
        horizontalAlignment: Text.AlignHCenter
        font.pixelSize: Theme.value
        color: Theme.header
    }
    Item {
        id: pagesArea

        x: root.isSplit ? root.listWidth + 1 : 0
        width: root.width - x
        height: root.height
        clip: root.isSplit
        visible: root.pagesTab === root.shell.currentIndex
        enabled: !root.isPresenting
    }
    Item {
        id: sheetsArea

        anchors.fill: parent
    }

    Connections {
        target: root.shell
        function onPresentExport(screen) { root.present("ExportViewController", {binding: screen}) }
    }
}
