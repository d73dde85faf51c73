<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="en_US" sourcelanguage="en_US">
<context>
    <name>tavrin</name>
    <message numerus="yes">
        <source>.DICT.BYTES.%d</source>
        <translation>
            <numerusform>%n byte</numerusform>
            <numerusform>%n bytes</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS.%d</source>
        <translation>
            <numerusform>%n item</numerusform>
            <numerusform>%n items</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS_SELECTED.%d</source>
        <translation>
            <numerusform>%n Item Selected</numerusform>
            <numerusform>%n Items Selected</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>Move %n Item</numerusform>
            <numerusform>Move %n Items</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>%n item could not be moved.</numerusform>
            <numerusform>%n items could not be moved.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_DELETE_ITEMS.%d</source>
        <translation>
            <numerusform>%n item could not be deleted.</numerusform>
            <numerusform>%n items could not be deleted.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.SENDING.%d</source>
        <translation>
            <numerusform>Sending %n document</numerusform>
            <numerusform>Sending %n documents</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.RECEIVING.%d</source>
        <translation>
            <numerusform>Receiving %n document</numerusform>
            <numerusform>Receiving %n documents</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MORE.%d</source>
        <translation>
            <numerusform>and %n more</numerusform>
            <numerusform>and %n more</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.WAITING.%d</source>
        <translation>
            <numerusform>%n document waits</numerusform>
            <numerusform>%n documents wait</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.AVAILABLE.%g</source>
        <translation>
            <numerusform>%@ available</numerusform>
            <numerusform>%@ available</numerusform>
        </translation>
    </message>
</context>
</TS>
