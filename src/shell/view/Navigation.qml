import QtQuick

// What a screen may ask of the shell. Each screen has a property `navigation`, which the shell sets.
//
// A component is a Component or the name of a QML file of this module, such as "MetricDetailsViewController". The new
// item gets `properties` and a `navigation` of its own, whatever `properties` say of that. A screen may have
// `property string title` (text of the bar over it), `property string longTitle` (what the large title says instead),
// `property Flickable flickable` (its scrolling collapses the large title), and, if it is presented,
// `property real sheetHeight` (what it needs of a sheet).
QtObject {
    signal pushRequested(var component, var properties)
    signal popRequested
    signal presentRequested(var component, var properties)
    signal dismissRequested

    // Shows a screen over this one, with a way back.
    function push(component, properties) { pushRequested(component, properties || {}) }
    function pop() { popRequested() }
    // Shows a screen over the whole window, until it is dismissed.
    function present(component, properties) { presentRequested(component, properties || {}) }
    function dismiss() { dismissRequested() }
}
