import QtQuick

// What a screen may ask of the shell. The shell gives one to each screen that has a property `navigation`.
//
// A component is a Component or the name of a QML file of this module, such as "MetricDetailsViewController". The new
// item gets `properties`. A screen may have `property string title` (text of the bar over it) and
// `property Flickable flickable` (its scrolling collapses the large title).
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
