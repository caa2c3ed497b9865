import QtQuick
import Quorl

// What no screen of the product shows, or not in every state, on one page.
FocusScope {
    id: gallery

    required property TickerColumnsModel ticker
    required property BandCellsModel bands

    anchors.fill: parent
    focus: true

    Rectangle {
        anchors.fill: parent
        color: Theme.background
    }
    Column {
        id: widgets

        width: parent.width

        TickerViewController {
            objectName: "ticker"
            width: parent.width
            height: 80
            model: gallery.ticker
        }
        SecondVCCell {
            objectName: "secondCell"
            width: parent.width
            leftText: "kHVCellMonitorCellRadioAccessTechnology"
            rightText: "LTE"
            metricFavorited: true
        }
        SecondVCCell {
            width: parent.width
            leftText: "rsrp"
            rightText: "-97 dBm"
        }
        FavoritesTableCellV2 {
            objectName: "favoritesCell"
            width: parent.width
            titleText: "File name: 000001-Default.chunk"
            subtitleText: "File Size: 32 KB"
            valueText: "Jan 5, 2026, 9:30:12 AM"
            showsActivityIndicator: true
        }
        Item {
            width: parent.width
            height: 60

            LoadingView {
                objectName: "loading"
                anchors.centerIn: parent
                text: "Gathering metrics from database"
            }
        }
        Item {
            width: parent.width
            height: 120

            SpinningView {
                objectName: "spinning"
                anchors.fill: parent
                isShowing: true
            }
        }
    }
    HorvaneMetricDetails {
        objectName: "bands"
        anchors.top: widgets.bottom
        anchors.bottom: parent.bottom
        width: parent.width
        model: gallery.bands
    }
    Toast {
        objectName: "toastPlace"
        anchors.fill: parent
        isShowing: true
        text: "copied"
    }
}
