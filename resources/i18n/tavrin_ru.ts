<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ru_RU" sourcelanguage="en_US">
<context>
    <name>tavrin</name>
    <message numerus="yes">
        <source>.DICT.BYTES.%d</source>
        <translation>
            <numerusform>%n байт</numerusform>
            <numerusform>%n байта</numerusform>
            <numerusform>%n байт</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS.%d</source>
        <translation>
            <numerusform>%n объект</numerusform>
            <numerusform>%n объекта</numerusform>
            <numerusform>%n объектов</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS_SELECTED.%d</source>
        <translation>
            <numerusform>Выбран %n объект</numerusform>
            <numerusform>Выбрано %n объекта</numerusform>
            <numerusform>Выбрано %n объектов</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>Переместить %n объект</numerusform>
            <numerusform>Переместить %n объекта</numerusform>
            <numerusform>Переместить %n объектов</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>Не удалось переместить %n объект.</numerusform>
            <numerusform>Не удалось переместить %n объекта.</numerusform>
            <numerusform>Не удалось переместить %n объектов.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_DELETE_ITEMS.%d</source>
        <translation>
            <numerusform>Не удалось удалить %n объект.</numerusform>
            <numerusform>Не удалось удалить %n объекта.</numerusform>
            <numerusform>Не удалось удалить %n объектов.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.SENDING.%d</source>
        <translation>
            <numerusform>Отправляется %n документ</numerusform>
            <numerusform>Отправляются %n документа</numerusform>
            <numerusform>Отправляются %n документов</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.RECEIVING.%d</source>
        <translation>
            <numerusform>Принимается %n документ</numerusform>
            <numerusform>Принимаются %n документа</numerusform>
            <numerusform>Принимаются %n документов</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MORE.%d</source>
        <translation>
            <numerusform>и ещё %n</numerusform>
            <numerusform>и ещё %n</numerusform>
            <numerusform>и ещё %n</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.WAITING.%d</source>
        <translation>
            <numerusform>%n документ ожидает</numerusform>
            <numerusform>%n документа ожидают</numerusform>
            <numerusform>%n документов ожидают</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.AVAILABLE.%g</source>
        <translation>
            <numerusform>доступно %@</numerusform>
            <numerusform>доступно %@</numerusform>
            <numerusform>доступно %@</numerusform>
        </translation>
    </message>
    <!-- Names, sizes, places -->
    <message>
        <source>%@ KB</source>
        <translation>%@&#xa0;КБ</translation>
    </message>
    <message>
        <source>%@ MB</source>
        <translation>%@&#xa0;МБ</translation>
    </message>
    <message>
        <source>%@ GB</source>
        <translation>%@&#xa0;ГБ</translation>
    </message>
    <message>
        <source>%@ TB</source>
        <translation>%@&#xa0;ТБ</translation>
    </message>
    <message>
        <source>%@ PB</source>
        <translation>%@&#xa0;ПБ</translation>
    </message>
    <message>
        <source>%@ EB</source>
        <translation>%@&#xa0;ЭБ</translation>
    </message>
    <message>
        <source>%1$@ of %2$@</source>
        <translation>%1$@ из %2$@</translation>
    </message>
    <message>
        <source>%1$@, %2$@</source>
        <translation>%1$@, %2$@</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>Документы</translation>
    </message>
    <message>
        <source>Kind</source>
        <translation>Тип</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>Размер</translation>
    </message>
    <message>
        <source>Where</source>
        <translation>Где</translation>
    </message>
    <message>
        <source>Created</source>
        <translation>Создан</translation>
    </message>
    <message>
        <source>Modified</source>
        <translation>Изменён</translation>
    </message>
    <message>
        <source>Tags</source>
        <translation>Теги</translation>
    </message>
    <message>
        <source>Shared</source>
        <translation>Общий доступ</translation>
    </message>
    <!-- Kinds of documents -->
    <message>
        <source>Document</source>
        <translation>Документ</translation>
    </message>
    <message>
        <source>Folder</source>
        <translation>Папка</translation>
    </message>
    <message>
        <source>Package</source>
        <translation>Пакет</translation>
    </message>
    <message>
        <source>Rich text document with attachments</source>
        <translation>Форматированный текст с вложениями</translation>
    </message>
    <message>
        <source>Document package</source>
        <translation>Пакет документа</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>Текст</translation>
    </message>
    <message>
        <source>Source code</source>
        <translation>Исходный код</translation>
    </message>
    <message>
        <source>Image</source>
        <translation>Изображение</translation>
    </message>
    <message>
        <source>Movie</source>
        <translation>Видео</translation>
    </message>
    <message>
        <source>Audio</source>
        <translation>Аудио</translation>
    </message>
    <message>
        <source>Audio or video</source>
        <translation>Аудио или видео</translation>
    </message>
    <message>
        <source>Archive</source>
        <translation>Архив</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>Шрифт</translation>
    </message>
    <!-- Buttons and actions -->
    <message>
        <source>OK</source>
        <translation>OK</translation>
    </message>
    <message>
        <source>Cancel</source>
        <translation>Отмена</translation>
    </message>
    <message>
        <source>Done</source>
        <translation>Готово</translation>
    </message>
    <message>
        <source>Create</source>
        <translation>Создать</translation>
    </message>
    <message>
        <source>Back</source>
        <translation>Назад</translation>
    </message>
    <message>
        <source>More</source>
        <translation>Ещё</translation>
    </message>
    <message>
        <source>Info</source>
        <translation>Сведения</translation>
    </message>
    <message>
        <source>Select</source>
        <translation>Выбрать</translation>
    </message>
    <message>
        <source>Select Items</source>
        <translation>Выберите объекты</translation>
    </message>
    <message>
        <source>Move</source>
        <translation>Переместить</translation>
    </message>
    <message>
        <source>Move Here</source>
        <translation>Переместить сюда</translation>
    </message>
    <message>
        <source>Move to Folder…</source>
        <translation>Переместить в папку…</translation>
    </message>
    <message>
        <source>Move “%1$@”</source>
        <translation>Переместить «%1$@»</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Удалить</translation>
    </message>
    <message>
        <source>Delete from Tavrin</source>
        <translation>Удалить из Tavrin</translation>
    </message>
    <message>
        <source>Rename</source>
        <translation>Переименовать</translation>
    </message>
    <message>
        <source>Rename Item</source>
        <translation>Переименовать объект</translation>
    </message>
    <message>
        <source>Rename Item…</source>
        <translation>Переименовать объект…</translation>
    </message>
    <message>
        <source>Share</source>
        <translation>Поделиться</translation>
    </message>
    <message>
        <source>Share Item…</source>
        <translation>Поделиться объектом…</translation>
    </message>
    <message>
        <source>Copy</source>
        <translation>Скопировать</translation>
    </message>
    <message>
        <source>Copy Path</source>
        <translation>Скопировать путь</translation>
    </message>
    <message>
        <source>Send by Mail</source>
        <translation>Отправить по почте</translation>
    </message>
    <message>
        <source>Open in “%@”</source>
        <translation>Открыть в «%@»</translation>
    </message>
    <message>
        <source>Open in “%1$@”</source>
        <translation>Открыть в «%1$@»</translation>
    </message>
    <message>
        <source>Search</source>
        <translation>Поиск</translation>
    </message>
    <message>
        <source>Try Again</source>
        <translation>Повторить</translation>
    </message>
    <message>
        <source>Clear text</source>
        <translation>Очистить текст</translation>
    </message>
    <message>
        <source>Zoom in</source>
        <translation>Увеличить</translation>
    </message>
    <message>
        <source>Zoom out</source>
        <translation>Уменьшить</translation>
    </message>
    <!-- New folders and names -->
    <message>
        <source>New Folder</source>
        <translation>Новая папка</translation>
    </message>
    <message>
        <source>Folder Name</source>
        <translation>Название папки</translation>
    </message>
    <message>
        <source>Enter a name for this folder.</source>
        <translation>Введите название папки.</translation>
    </message>
    <message>
        <source>Enter a new name for this item.</source>
        <translation>Введите новое название объекта.</translation>
    </message>
    <message>
        <source>Character not allowed in filename</source>
        <translation>Недопустимый символ в имени файла</translation>
    </message>
    <message>
        <source>Choose a different name.</source>
        <translation>Выберите другое имя.</translation>
    </message>
    <message>
        <source>The name “%@” is already taken.</source>
        <translation>Имя «%@» уже занято.</translation>
    </message>
    <message>
        <source>The name “%1$@” with extension “.%2$@” is already taken.</source>
        <translation>Имя «%1$@» с расширением «.%2$@» уже занято.</translation>
    </message>
    <message>
        <source>The name “%@” can’t be used. Try using a name with fewer characters, or with no punctuation marks.</source>
        <translation>Имя «%@» нельзя использовать. Попробуйте имя покороче или без знаков препинания.</translation>
    </message>
    <message>
        <source>The folder could not be made.</source>
        <translation>Не удалось создать папку.</translation>
    </message>
    <!-- Deleting -->
    <message>
        <source>%@ will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>Из Tavrin на всех ваших устройствах будет безвозвратно удалено: %@. Это действие нельзя отменить.</translation>
    </message>
    <message>
        <source>&quot;%@&quot; will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>Объект «%@» будет безвозвратно удалён из Tavrin на всех ваших устройствах. Это действие нельзя отменить.</translation>
    </message>
    <message>
        <source>The %@ app library, and all its documents, will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>Библиотека приложения «%@» и все её документы будут безвозвратно удалены из Tavrin на всех ваших устройствах. Это действие нельзя отменить.</translation>
    </message>
    <!-- Lists and the search -->
    <message>
        <source>No documents here</source>
        <translation>Здесь нет документов</translation>
    </message>
    <message>
        <source>What applications keep in the cloud appears here.</source>
        <translation>Здесь появится то, что приложения хранят в облаке.</translation>
    </message>
    <message>
        <source>Documents that are added to this folder, here or on another device, appear here.</source>
        <translation>Здесь появятся документы, добавленные в эту папку с этого или другого устройства.</translation>
    </message>
    <message>
        <source>This folder is no longer here</source>
        <translation>Этой папки здесь больше нет</translation>
    </message>
    <message>
        <source>This folder cannot be shown</source>
        <translation>Не удаётся показать эту папку</translation>
    </message>
    <message>
        <source>Search all documents</source>
        <translation>Поиск по всем документам</translation>
    </message>
    <message>
        <source>Type a part of a name</source>
        <translation>Введите часть имени</translation>
    </message>
    <message>
        <source>Documents and folders of the whole store are found, also those that are not downloaded.</source>
        <translation>Поиск идёт по документам и папкам всего хранилища, в том числе незагруженным.</translation>
    </message>
    <message>
        <source>Nothing found</source>
        <translation>Ничего не найдено</translation>
    </message>
    <message>
        <source>No name in the store contains “%1$@”.</source>
        <translation>В хранилище нет имён, содержащих «%1$@».</translation>
    </message>
    <message>
        <source>Downloading</source>
        <translation>Загружается</translation>
    </message>
    <message>
        <source>Not downloaded</source>
        <translation>Не загружено</translation>
    </message>
    <!-- Choosing where to move -->
    <message>
        <source>Nothing here yet</source>
        <translation>Здесь пока ничего нет</translation>
    </message>
    <message>
        <source>An item with this name is here already.</source>
        <translation>Объект с таким именем здесь уже есть.</translation>
    </message>
    <message>
        <source>Items with these names are here already.</source>
        <translation>Объекты с такими именами здесь уже есть.</translation>
    </message>
    <message>
        <source>Open the folder into which to move.</source>
        <translation>Откройте папку, в которую нужно переместить.</translation>
    </message>
    <message>
        <source>This folder does not take documents.</source>
        <translation>В эту папку нельзя поместить документы.</translation>
    </message>
    <message>
        <source>A folder cannot be moved into itself.</source>
        <translation>Папку нельзя переместить в саму себя.</translation>
    </message>
    <message>
        <source>“%1$@” is here already.</source>
        <translation>«%1$@» уже здесь.</translation>
    </message>
    <message>
        <source>These items are here already.</source>
        <translation>Эти объекты уже здесь.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders.</source>
        <translation>В «%1$@» нельзя поместить папки.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders within folders.</source>
        <translation>В «%1$@» нельзя поместить папки внутри папок.</translation>
    </message>
    <message>
        <source>“%1$@” does not take documents of this kind.</source>
        <translation>В «%1$@» нельзя поместить документы этого типа.</translation>
    </message>
    <message>
        <source>“%1$@” does not take all of these documents.</source>
        <translation>В «%1$@» можно поместить не все эти документы.</translation>
    </message>
    <!-- Showing and downloading -->
    <message>
        <source>Loading…</source>
        <translation>Загрузка…</translation>
    </message>
    <message>
        <source>Waiting…</source>
        <translation>Ожидание…</translation>
    </message>
    <message>
        <source>Download</source>
        <translation>Загрузить</translation>
    </message>
    <message>
        <source>Download to View</source>
        <translation>Загрузить для просмотра</translation>
    </message>
    <message>
        <source>Cancel Download</source>
        <translation>Отменить загрузку</translation>
    </message>
    <message>
        <source>Downloading “%1$@”</source>
        <translation>Загрузка «%1$@»</translation>
    </message>
    <message>
        <source>This item is over %@.</source>
        <translation>Размер этого объекта превышает %@.</translation>
    </message>
    <message>
        <source>“%@” will not download until you connect to Wi-Fi.</source>
        <translation>Объект «%@» не загрузится, пока вы не подключитесь к сети Wi-Fi.</translation>
    </message>
    <message>
        <source>Unable to download file. You are no longer connected to the Internet.</source>
        <translation>Не удаётся загрузить файл. Подключение к интернету потеряно.</translation>
    </message>
    <message>
        <source>Picture “%1$@”</source>
        <translation>Изображение «%1$@»</translation>
    </message>
    <message>
        <source>There is no document to show</source>
        <translation>Нет документа для просмотра</translation>
    </message>
    <message>
        <source>This kind of document cannot be shown here.</source>
        <translation>Документы этого типа нельзя показать здесь.</translation>
    </message>
    <message>
        <source>“%1$@” is too large to be shown here.</source>
        <translation>Документ «%1$@» слишком велик, чтобы показать его здесь.</translation>
    </message>
    <message>
        <source>There is no application for it on this device.</source>
        <translation>На этом устройстве нет подходящего приложения.</translation>
    </message>
    <message>
        <source>This document cannot be shown.</source>
        <translation>Не удаётся показать этот документ.</translation>
    </message>
    <message>
        <source>This document is protected by a password. It can be read in an application that asks for it.</source>
        <translation>Этот документ защищён паролем. Откройте его в приложении, которое запросит пароль.</translation>
    </message>
    <message>
        <source>This is a folder, not a document.</source>
        <translation>Это папка, а не документ.</translation>
    </message>
    <message>
        <source>There is nothing in this document.</source>
        <translation>Этот документ пуст.</translation>
    </message>
    <message>
        <source>Open With…</source>
        <translation>Открыть с помощью…</translation>
    </message>
    <message>
        <source>“%1$@” cannot be played. It may be damaged, or of a kind for which there is no decoder here.</source>
        <translation>Файл «%1$@» нельзя воспроизвести. Возможно, он повреждён или для него здесь нет декодера.</translation>
    </message>
    <message>
        <source>Sound and films cannot be played: a part of this program is missing. Install it again.</source>
        <translation>Звук и фильмы воспроизвести нельзя: не хватает части этой программы. Установите её заново.</translation>
    </message>
    <message>
        <source>There is no device here to hear the sound from.</source>
        <translation>Здесь нет устройства для вывода звука.</translation>
    </message>
    <message>
        <source>Play</source>
        <translation>Воспроизвести</translation>
    </message>
    <message>
        <source>Pause</source>
        <translation>Пауза</translation>
    </message>
    <message>
        <source>Mute</source>
        <translation>Выключить звук</translation>
    </message>
    <message>
        <source>Unmute</source>
        <translation>Включить звук</translation>
    </message>
    <message>
        <source>Position</source>
        <translation>Позиция</translation>
    </message>
    <message>
        <source>Volume</source>
        <translation>Громкость</translation>
    </message>
    <message>
        <source>“%1$@” cannot be shown. It may be damaged, or need a password.</source>
        <translation>Документ «%1$@» нельзя показать. Возможно, он повреждён или защищён паролем.</translation>
    </message>
    <message>
        <source>This document is too large to be shown here.</source>
        <translation>Этот документ слишком велик, чтобы показать его здесь.</translation>
    </message>
    <message>
        <source>It takes too long to show this document here.</source>
        <translation>Показ этого документа здесь занимает слишком много времени.</translation>
    </message>
    <message>
        <source>This document consists of several files. A program that knows its kind shows them as one.</source>
        <translation>Этот документ состоит из нескольких файлов. Программа, знающая его вид, показывает их как одно целое.</translation>
    </message>
    <message>
        <source>There is more in this document than is listed here.</source>
        <translation>В этом документе есть и другое: здесь показано не всё.</translation>
    </message>
    <message>
        <source>%1$@, %2$@ unpacked</source>
        <translation>%1$@, в распакованном виде %2$@</translation>
    </message>
    <message>
        <source>Still being read. This is what there is so far.</source>
        <translation>Чтение ещё идёт. Пока показано то, что уже прочитано.</translation>
    </message>
    <message>
        <source>The archive is damaged. This is what could be read before the damage.</source>
        <translation>Архив повреждён. Показано то, что удалось прочитать до места повреждения.</translation>
    </message>
    <message>
        <source>There is more in this archive than is listed here.</source>
        <translation>В этом архиве есть и другое: здесь показано не всё.</translation>
    </message>
    <message>
        <source>Unpacking it takes a password.</source>
        <translation>Для распаковки нужен пароль.</translation>
    </message>
    <message>
        <source>What is in this archive can only be seen with its password.</source>
        <translation>Содержимое этого архива можно увидеть только с паролем.</translation>
    </message>
    <message>
        <source>There is nothing in this archive.</source>
        <translation>Этот архив пуст.</translation>
    </message>
    <message>
        <source>A part of this program is missing: archives cannot be listed. Install it again.</source>
        <translation>Не хватает части этой программы: содержимое архивов показать нельзя. Установите её заново.</translation>
    </message>
    <message>
        <source>A part of this program is missing: drawings cannot be shown. Install it again.</source>
        <translation>Не хватает части этой программы: рисунки показать нельзя. Установите её заново.</translation>
    </message>
    <message>
        <source>Encrypted</source>
        <translation>Зашифровано</translation>
    </message>
    <message>
        <source>Link</source>
        <translation>Ссылка</translation>
    </message>
    <message>
        <source>This document is not on this device. Download it first.</source>
        <translation>Этого документа нет на устройстве. Сначала загрузите его.</translation>
    </message>
    <message>
        <source>“%1$@” is damaged, or not what its name says.</source>
        <translation>Документ «%1$@» повреждён или не соответствует своему имени.</translation>
    </message>
    <message>
        <source>“%1$@” could not be opened</source>
        <translation>Не удалось открыть «%1$@»</translation>
    </message>
    <message>
        <source>“%1$@” could not be copied</source>
        <translation>Не удалось скопировать «%1$@»</translation>
    </message>
    <message>
        <source>“%1$@” could not be sent</source>
        <translation>Не удалось отправить «%1$@»</translation>
    </message>
    <message>
        <source>“%1$@” could not be started. %2$@</source>
        <translation>Не удалось запустить «%1$@». %2$@</translation>
    </message>
    <message>
        <source>“%1$@” ended as soon as it had been started (exit status %2$@).</source>
        <translation>Программа «%1$@» завершилась сразу после запуска (код завершения %2$@).</translation>
    </message>
    <!-- The account and the network -->
    <message>
        <source>Offline</source>
        <translation>Не в сети</translation>
    </message>
    <message>
        <source>Cellular</source>
        <translation>Сотовая сеть</translation>
    </message>
    <message>
        <source>Wi-Fi</source>
        <translation>Wi-Fi</translation>
    </message>
    <message>
        <source>Network activity</source>
        <translation>Сетевая активность</translation>
    </message>
    <message>
        <source>Not signed in</source>
        <translation>Вход не выполнен</translation>
    </message>
    <message>
        <source>Pelmora is not enabled</source>
        <translation>Служба Pelmora не включена</translation>
    </message>
    <message>
        <source>Sign in to a folder that holds your documents, such as a disk or a network folder. In a terminal, type:</source>
        <translation>Войдите в папку с вашими документами, например на диске или в сети. Введите в терминале:</translation>
    </message>
    <message>
        <source>PATH is that folder. The documents appear here as soon as you are signed in.</source>
        <translation>PATH — путь к этой папке. Документы появятся здесь, как только вы войдёте.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in.</source>
        <translation>Вход в учётную запись Pelmora не выполнен.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in. Sign in with the command “pelmora sign-in”.</source>
        <translation>Вход в учётную запись Pelmora не выполнен. Войдите командой «pelmora sign-in».</translation>
    </message>
    <message>
        <source>The account is of the kind “%1$@”, which this version does not know. Update the program or sign in again.</source>
        <translation>Тип учётной записи «%1$@» неизвестен этой версии. Обновите программу или войдите заново.</translation>
    </message>
    <message>
        <source>This version cannot use accounts of the kind “%1$@” yet. Update the program or sign in to a folder.</source>
        <translation>Эта версия ещё не работает с учётными записями типа «%1$@». Обновите программу или войдите в папку.</translation>
    </message>
    <message>
        <source>The account's folder “%1$@” is not an absolute path. Sign in again with the whole path.</source>
        <translation>Папка учётной записи «%1$@» указана не полным путём. Войдите заново, указав полный путь.</translation>
    </message>
    <message>
        <source>The account file “%1$@” does not say who is signed in. Sign in again.</source>
        <translation>В файле учётной записи «%1$@» не указано, кто вошёл. Войдите заново.</translation>
    </message>
    <message>
        <source>The account file “%1$@” cannot be read. Check its permissions.</source>
        <translation>Не удаётся прочитать файл учётной записи «%1$@». Проверьте права доступа к нему.</translation>
    </message>
    <message>
        <source>The account file “%1$@” is damaged. Sign in again.</source>
        <translation>Файл учётной записи «%1$@» повреждён. Войдите заново.</translation>
    </message>
    <message>
        <source>The folder “%1$@” of your Pelmora account is not there. Connect its disk, or sign in again if it has moved.</source>
        <translation>Папки «%1$@» вашей учётной записи Pelmora нет на месте. Подключите её диск или войдите заново, если она перемещена.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Connect the right disk, or sign in to another folder.</source>
        <translation>По адресу «%1$@» сейчас не то, с чем была связана эта учётная запись. Подключите нужный диск или войдите в другую папку.</translation>
    </message>
    <message>
        <source>The file “%1$@” of the account is damaged. Repair or remove it.</source>
        <translation>Файл «%1$@» учётной записи повреждён. Исправьте или удалите его.</translation>
    </message>
    <message>
        <source>The account does not tell how much room is left.</source>
        <translation>Учётная запись не сообщает, сколько места осталось.</translation>
    </message>
    <message>
        <source>The Pelmora server cannot be reached. Check the connection and try again.</source>
        <translation>Сервер Pelmora недоступен. Проверьте подключение и повторите попытку.</translation>
    </message>
    <message>
        <source>The Pelmora server did not accept the user name or the password.</source>
        <translation>Сервер Pelmora не принял имя пользователя или пароль.</translation>
    </message>
    <message>
        <source>The Pelmora server refused the request for “%1$@”.</source>
        <translation>Сервер Pelmora отклонил запрос для «%1$@».</translation>
    </message>
    <message>
        <source>The Pelmora server cannot store an item named “%1$@”. Choose a different name.</source>
        <translation>Сервер Pelmora не может сохранить объект с именем «%1$@». Выберите другое имя.</translation>
    </message>
    <message>
        <source>There is no space left in your Pelmora account. Delete something to make room.</source>
        <translation>В вашей учётной записи Pelmora не осталось места. Удалите что-нибудь, чтобы освободить его.</translation>
    </message>
    <message>
        <source>The file of passwords “%1$@” is damaged. Move it away and sign in again.</source>
        <translation>Файл паролей «%1$@» повреждён. Уберите его и войдите снова.</translation>
    </message>
    <message>
        <source>The keyring does not answer. Unlock it, or restart its service, and try again.</source>
        <translation>Связка ключей не отвечает. Разблокируйте её или перезапустите её службу и попробуйте ещё раз.</translation>
    </message>
    <message>
        <source>The keyring refused (%1$@). Unlock it and try again.</source>
        <translation>Связка ключей отказала (%1$@). Разблокируйте её и попробуйте ещё раз.</translation>
    </message>
    <message>
        <source>There is no keyring on this desk that could keep the password.</source>
        <translation>На этом устройстве нет связки ключей, которая могла бы хранить пароль.</translation>
    </message>
    <message>
        <source>The store has work in it that was interrupted. Use it once more, so that it comes to its end, and sign out then.</source>
        <translation>В хранилище осталась прерванная работа. Откройте его ещё раз, чтобы она завершилась, и затем выйдите.</translation>
    </message>
    <message>
        <source>Waits for a network that is not metered. “Sync Now” does not wait.</source>
        <translation>Ожидает сети без учёта трафика. «Синхронизировать» не ждёт.</translation>
    </message>
    <message>
        <source>Your documents can be on a server, or in a folder such as a disk or a network folder.</source>
        <translation>Ваши документы могут находиться на сервере или в папке, например на диске или в сети.</translation>
    </message>
    <message>
        <source>Sending “%1$@”</source>
        <translation>Отправляется «%1$@»</translation>
    </message>
    <message>
        <source>Receiving “%1$@”</source>
        <translation>Принимается «%1$@»</translation>
    </message>
    <message>
        <source>“%1$@”: %2$@</source>
        <translation>«%1$@»: %2$@</translation>
    </message>
    <message>
        <source>%1$@ at %2$@</source>
        <translation>%1$@ на %2$@</translation>
    </message>
    <message>
        <source>Account</source>
        <translation>Учётная запись</translation>
    </message>
    <message>
        <source>On Its Way</source>
        <translation>В пути</translation>
    </message>
    <message>
        <source>Waiting</source>
        <translation>Ожидает</translation>
    </message>
    <message>
        <source>Sync Now</source>
        <translation>Синхронизировать</translation>
    </message>
    <message>
        <source>Sign In to Another Account…</source>
        <translation>Войти в другую учётную запись…</translation>
    </message>
    <message>
        <source>Sign Out…</source>
        <translation>Выйти…</translation>
    </message>
    <message>
        <source>The Password Is Wanted</source>
        <translation>Нужен пароль</translation>
    </message>
    <message>
        <source>Enter Password…</source>
        <translation>Ввести пароль…</translation>
    </message>
    <message>
        <source>Delete on Both Sides</source>
        <translation>Удалить с обеих сторон</translation>
    </message>
    <message>
        <source>Changed on Both Sides</source>
        <translation>Изменено с обеих сторон</translation>
    </message>
    <message>
        <source>Show the First</source>
        <translation>Показать первый</translation>
    </message>
    <message>
        <source>Names That Cannot Be Kept</source>
        <translation>Недопустимые имена</translation>
    </message>
    <message>
        <source>Use “%1$@”</source>
        <translation>Использовать «%1$@»</translation>
    </message>
    <message>
        <source>The server does not accept the password that is kept here. Nothing is sent or received before it has the right one.</source>
        <translation>Сервер не принимает сохранённый здесь пароль. Ничего не отправляется и не принимается, пока не указан верный.</translation>
    </message>
    <message>
        <source>Both versions are kept side by side. Compare them and delete the one that you do not want.</source>
        <translation>Обе версии сохранены рядом. Сравните их и удалите ненужную.</translation>
    </message>
    <message>
        <source>Comparing both sides…</source>
        <translation>Сравнение обеих сторон…</translation>
    </message>
    <message>
        <source>Something waits. It is tried again by itself.</source>
        <translation>Что-то ожидает. Попытка повторится сама.</translation>
    </message>
    <message>
        <source>Everything is on both sides.</source>
        <translation>Всё есть на обеих сторонах.</translation>
    </message>
    <message>
        <source>Sign In to a Server…</source>
        <translation>Войти на сервер…</translation>
    </message>
    <message>
        <source>Use a Folder…</source>
        <translation>Использовать папку…</translation>
    </message>
    <message>
        <source>Sign Out of “%1$@”?</source>
        <translation>Выйти из «%1$@»?</translation>
    </message>
    <message>
        <source>The account keeps its documents. Those on this device can stay in their folder or be removed.</source>
        <translation>Документы останутся в учётной записи. Те, что на этом устройстве, можно оставить в папке или удалить.</translation>
    </message>
    <message>
        <source>Keep Files on This Device</source>
        <translation>Оставить файлы на устройстве</translation>
    </message>
    <message>
        <source>Remove Files from This Device</source>
        <translation>Удалить файлы с устройства</translation>
    </message>
    <message>
        <source>Some Documents Stayed on This Device</source>
        <translation>Некоторые документы остались на устройстве</translation>
    </message>
    <message>
        <source>Not Everything Has Been Sent</source>
        <translation>Отправлено не всё</translation>
    </message>
    <message>
        <source>These are on this device alone, so nothing was removed:</source>
        <translation>Эти документы есть только на этом устройстве, поэтому ничего не удалено:</translation>
    </message>
    <message>
        <source>Keep Files and Sign Out</source>
        <translation>Оставить файлы и выйти</translation>
    </message>
    <message>
        <source>Stay Signed In</source>
        <translation>Не выходить</translation>
    </message>
    <message>
        <source>Keep the Password in a File?</source>
        <translation>Хранить пароль в файле?</translation>
    </message>
    <message>
        <source>It can lie in a file that you alone may read. The file is not encrypted: whoever has this disk in his hands can read it.</source>
        <translation>Его можно хранить в файле, доступном только вам. Файл не зашифрован: его прочтёт любой, у кого в руках этот диск.</translation>
    </message>
    <message>
        <source>Keep It in a File</source>
        <translation>Хранить в файле</translation>
    </message>
    <message>
        <source>Password for “%1$@”</source>
        <translation>Пароль для «%1$@»</translation>
    </message>
    <message>
        <source>Password</source>
        <translation>Пароль</translation>
    </message>
    <message>
        <source>Sign In</source>
        <translation>Войти</translation>
    </message>
    <message>
        <source>Not Now</source>
        <translation>Не сейчас</translation>
    </message>
    <message>
        <source>Server</source>
        <translation>Сервер</translation>
    </message>
    <message>
        <source>Your documents stay on a WebDAV server, such as one of your own or your company's.</source>
        <translation>Документы остаются на сервере WebDAV, например вашем собственном или вашей компании.</translation>
    </message>
    <message>
        <source>Your documents stay in a folder of this machine, of a disk, or of a network.</source>
        <translation>Документы остаются в папке этого компьютера, диска или сети.</translation>
    </message>
    <message>
        <source>Address</source>
        <translation>Адрес</translation>
    </message>
    <message>
        <source>Path of the Folder</source>
        <translation>Путь к папке</translation>
    </message>
    <message>
        <source>User</source>
        <translation>Пользователь</translation>
    </message>
    <message>
        <source>File of Certificates to Trust</source>
        <translation>Файл доверенных сертификатов</translation>
    </message>
    <message>
        <source>Give the address of the server.</source>
        <translation>Укажите адрес сервера.</translation>
    </message>
    <message>
        <source>Give the folder of the account.</source>
        <translation>Укажите папку учётной записи.</translation>
    </message>
    <message>
        <source>Give the name of the user.</source>
        <translation>Укажите имя пользователя.</translation>
    </message>
    <message>
        <source>The Way to This Server Is Not Encrypted</source>
        <translation>Соединение с этим сервером не зашифровано</translation>
    </message>
    <message>
        <source>Everybody on the way can read the password and the documents. Use an address that begins with “https://” if the server has one.</source>
        <translation>Любой на пути может прочитать пароль и документы. Используйте адрес, начинающийся с «https://», если он есть у сервера.</translation>
    </message>
    <message>
        <source>Sign In Anyway</source>
        <translation>Всё равно войти</translation>
    </message>
    <message>
        <source>Looking at the server…</source>
        <translation>Проверка сервера…</translation>
    </message>
    <message>
        <source>Looking at the folder…</source>
        <translation>Проверка папки…</translation>
    </message>
    <message>
        <source>Signing in…</source>
        <translation>Выполняется вход…</translation>
    </message>
    <message>
        <source>“%1$@” is not a folder. Make it first, or connect its disk.</source>
        <translation>«%1$@» — не папка. Сначала создайте её или подключите диск.</translation>
    </message>
    <message>
        <source>The name of that folder is not UTF-8 text. Choose another folder.</source>
        <translation>Имя этой папки — не текст UTF-8. Выберите другую папку.</translation>
    </message>
    <message>
        <source>“%1$@” holds the stores of accounts themselves. Choose another folder.</source>
        <translation>В «%1$@» лежат сами хранилища учётных записей. Выберите другую папку.</translation>
    </message>
    <message>
        <source>“%1$@” lies in the store of an account. Choose another folder.</source>
        <translation>«%1$@» находится в хранилище учётной записи. Выберите другую папку.</translation>
    </message>
    <message>
        <source>There is no file of certificates at “%1$@”.</source>
        <translation>По пути «%1$@» нет файла сертификатов.</translation>
    </message>
    <message>
        <source>The server lets you read here, and change nothing.</source>
        <translation>Сервер разрешает здесь чтение, но не изменения.</translation>
    </message>
    <message>
        <source>No password is kept here for this account.</source>
        <translation>Для этой учётной записи здесь не сохранён пароль.</translation>
    </message>
    <!-- The store and its documents -->
    <message>
        <source>The store has not been set up yet.</source>
        <translation>Хранилище ещё не настроено.</translation>
    </message>
    <message>
        <source>The store cannot be changed now.</source>
        <translation>Сейчас хранилище нельзя изменить.</translation>
    </message>
    <message>
        <source>The store is in use by another program (process %1$@). Wait until it has finished, or close it.</source>
        <translation>Хранилище занято другой программой (процесс %1$@). Дождитесь её завершения или закройте её.</translation>
    </message>
    <message>
        <source>The store was used by a later version of this program. Update the program to open it.</source>
        <translation>Хранилище использовалось более новой версией программы. Обновите программу, чтобы открыть его.</translation>
    </message>
    <message>
        <source>The store's records cannot be opened.</source>
        <translation>Не удаётся открыть данные хранилища.</translation>
    </message>
    <message>
        <source>The store's records were damaged. They were set aside as “%1$@” and are made anew from the disk and the account.</source>
        <translation>Данные хранилища были повреждены. Они отложены как «%1$@» и создаются заново по диску и учётной записи.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not the one that this store was made with. Put it back, or move “%2$@” away to begin anew; nothing was changed.</source>
        <translation>Папка «%1$@» — не та, с которой создано это хранилище. Верните прежнюю или уберите «%2$@», чтобы начать заново; ничего не изменено.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be moved.</source>
        <translation>«%1$@» — часть самого хранилища, переместить этот объект нельзя.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be deleted.</source>
        <translation>«%1$@» — часть самого хранилища, удалить этот объект нельзя.</translation>
    </message>
    <message>
        <source>“%1$@” has to be downloaded before it can leave your documents.</source>
        <translation>Объект «%1$@» нужно загрузить, прежде чем вынести его из ваших документов.</translation>
    </message>
    <message>
        <source>“%1$@” stays on this device: your account does not have this version yet.</source>
        <translation>Объект «%1$@» останется на устройстве: этой версии ещё нет в вашей учётной записи.</translation>
    </message>
    <message>
        <source>“%1$@” is no document that could be fetched again.</source>
        <translation>«%1$@» — не документ, который можно загрузить снова.</translation>
    </message>
    <message>
        <source>“%1$@” has not been uploaded yet, so its copy on this device is kept.</source>
        <translation>Объект «%1$@» ещё не выгружен, поэтому его копия остаётся на этом устройстве.</translation>
    </message>
    <message>
        <source>“%1$@” was changed on another device. Both versions are kept.</source>
        <translation>Объект «%1$@» изменён на другом устройстве. Обе версии сохранены.</translation>
    </message>
    <!-- Why an item is left out -->
    <message>
        <source>It is a symbolic link.</source>
        <translation>Это символическая ссылка.</translation>
    </message>
    <message>
        <source>It is neither a file nor a folder.</source>
        <translation>Это не файл и не папка.</translation>
    </message>
    <message>
        <source>It lies on another disk than the account's folder.</source>
        <translation>Объект находится не на том диске, где папка учётной записи.</translation>
    </message>
    <message>
        <source>It lies on another disk than the store.</source>
        <translation>Объект находится не на том диске, на котором хранилище.</translation>
    </message>
    <message>
        <source>Delete or Bring Back?</source>
        <translation>Удалить или вернуть?</translation>
    </message>
    <message>
        <source>Bring Them Back</source>
        <translation>Вернуть</translation>
    </message>
    <message>
        <source>Delete on the Account Too</source>
        <translation>Удалить и в учётной записи</translation>
    </message>
    <message>
        <source>Delete on This Device Too</source>
        <translation>Удалить и на этом устройстве</translation>
    </message>
    <message>
        <source>Decide Later</source>
        <translation>Решить позже</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from this device. Nothing is deleted on your account until you say so.</source>
        <translation>Объектов, пропавших с этого устройства: %1$@. В учётной записи ничего не будет удалено без вашего указания.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so.</source>
        <translation>Объектов, пропавших из вашей учётной записи: %1$@. На этом устройстве ничего не будет удалено без вашего указания.</translation>
    </message>
    <message>
        <source>“%1$@” is being written to without a pause. It will be on your account some moments after that has ended.</source>
        <translation>В «%1$@» непрерывно ведётся запись. Документ появится в учётной записи вскоре после её окончания.</translation>
    </message>
    <message>
        <source>Documents are being changed without a pause. What is new will be on your account some moments after that has ended.</source>
        <translation>Документы непрерывно меняются. Новое появится в учётной записи вскоре после окончания изменений.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so. %2$@ of them have no copy on this device and cannot be brought back.</source>
        <translation>Объектов, пропавших из вашей учётной записи: %1$@. На этом устройстве ничего не будет удалено без вашего указания. Из них не имеют копии на этом устройстве и не могут быть возвращены: %2$@.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not there. Connect its disk; nothing was changed.</source>
        <translation>Папки «%1$@» нет на месте. Подключите её диск; ничего не было изменено.</translation>
    </message>
    <message>
        <source>The disk cannot have an item of that name.</source>
        <translation>На диске не может быть объекта с таким именем.</translation>
    </message>
    <message>
        <source>The name is too long for the disk.</source>
        <translation>Имя слишком длинное для диска.</translation>
    </message>
    <message>
        <source>The name is one that the store uses itself.</source>
        <translation>Это имя использует само хранилище.</translation>
    </message>
    <message>
        <source>The name is one that the account uses itself.</source>
        <translation>Это имя использует сама учётная запись.</translation>
    </message>
    <message>
        <source>Names that begin with “.” and end in “.promise” are kept for promises.</source>
        <translation>Имена, которые начинаются с «.» и заканчиваются на «.promise», отведены для заполнителей.</translation>
    </message>
    <message>
        <source>Files on the device have the names that its promise would need.</source>
        <translation>Имена, нужные для заполнителя, уже заняты файлами на устройстве.</translation>
    </message>
    <message>
        <source>Something else has that name on the device.</source>
        <translation>Это имя на устройстве занято другим объектом.</translation>
    </message>
    <message>
        <source>A folder on the device has that name.</source>
        <translation>На устройстве есть папка с таким именем.</translation>
    </message>
    <message>
        <source>A file on the device has that name.</source>
        <translation>На устройстве есть файл с таким именем.</translation>
    </message>
    <!-- What can go wrong with a file -->
    <message>
        <source>“%1$@” is no longer there. It may have been moved or deleted.</source>
        <translation>Объекта «%1$@» больше нет. Возможно, его переместили или удалили.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be used here.</source>
        <translation>«%1$@» нельзя использовать здесь.</translation>
    </message>
    <message>
        <source>You do not have permission to read “%1$@”.</source>
        <translation>У вас нет прав на чтение «%1$@».</translation>
    </message>
    <message>
        <source>“%1$@” is damaged and cannot be read.</source>
        <translation>Объект «%1$@» повреждён, прочитать его нельзя.</translation>
    </message>
    <message>
        <source>“%1$@” could not be read or written because of a disk error.</source>
        <translation>Не удалось прочитать или записать «%1$@» из-за ошибки диска.</translation>
    </message>
    <message>
        <source>You do not have permission to change “%1$@”.</source>
        <translation>У вас нет прав на изменение «%1$@».</translation>
    </message>
    <message>
        <source>The name “%1$@” cannot be used. Choose a different name.</source>
        <translation>Имя «%1$@» нельзя использовать. Выберите другое имя.</translation>
    </message>
    <message>
        <source>An item named “%1$@” already exists. Choose a different name.</source>
        <translation>Объект с именем «%1$@» уже существует. Выберите другое имя.</translation>
    </message>
    <message>
        <source>The name “%1$@” is too long. Choose a shorter one.</source>
        <translation>Имя «%1$@» слишком длинное. Выберите имя покороче.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not empty.</source>
        <translation>Папка «%1$@» не пуста.</translation>
    </message>
    <message>
        <source>There is not enough free space on the disk for “%1$@”. Free some space and try again.</source>
        <translation>На диске недостаточно места для «%1$@». Освободите место и повторите попытку.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be changed because its disk is read-only.</source>
        <translation>Объект «%1$@» нельзя изменить: его диск доступен только для чтения.</translation>
    </message>
    <message>
        <source>The operation was cancelled.</source>
        <translation>Операция отменена.</translation>
    </message>
    <message>
        <source>A file cannot take the place of a folder, nor a folder that of a file.</source>
        <translation>Файл не может заменить папку, а папка — файл.</translation>
    </message>
    <message>
        <source>The operation on “%1$@” took too long. Try again.</source>
        <translation>Операция с «%1$@» заняла слишком много времени. Повторите попытку.</translation>
    </message>
    <message>
        <source>“%1$@” is in use. Close it elsewhere and try again.</source>
        <translation>Объект «%1$@» используется. Закройте его в другой программе и повторите попытку.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being read. Try again.</source>
        <translation>Объект «%1$@» изменился во время чтения. Повторите попытку.</translation>
    </message>
    <message>
        <source>“%1$@” lies on another disk and has to be copied there.</source>
        <translation>Объект «%1$@» находится на другом диске, его нужно скопировать.</translation>
    </message>
    <message>
        <source>The disk cannot swap “%1$@” and “%2$@”.</source>
        <translation>Диск не может поменять местами «%1$@» и «%2$@».</translation>
    </message>
    <message>
        <source>The disk that holds “%1$@” cannot keep this information.</source>
        <translation>Диск, на котором находится «%1$@», не может хранить эти сведения.</translation>
    </message>
    <!-- Starting, and being asked to open something -->
    <message>
        <source>Tavrin runs already and was asked to come forward.</source>
        <translation>Программа Tavrin уже запущена; её окно вызвано на передний план.</translation>
    </message>
    <message>
        <source>Tavrin runs already, but did not take the request: %1$@</source>
        <translation>Программа Tavrin уже запущена, но не приняла запрос: %1$@</translation>
    </message>
    <message>
        <source>Tavrin runs already, but does not answer. Close its window or end it, and try again.</source>
        <translation>Программа Tavrin уже запущена, но не отвечает. Закройте её окно или завершите её и повторите попытку.</translation>
    </message>
    <message>
        <source>Tavrin is busy with other requests. Try again.</source>
        <translation>Программа Tavrin занята другими запросами. Повторите попытку.</translation>
    </message>
    <message>
        <source>Tavrin was started but does not answer.</source>
        <translation>Программа Tavrin запущена, но не отвечает.</translation>
    </message>
    <message>
        <source>Tavrin could not start (exit status %1$@).</source>
        <translation>Не удалось запустить Tavrin (код завершения %1$@).</translation>
    </message>
    <message>
        <source>“%1$@” could not be started (%2$@). Install Tavrin again.</source>
        <translation>Не удалось запустить «%1$@» (%2$@). Переустановите Tavrin.</translation>
    </message>
    <message>
        <source>“%1$@” is no address of the kind tavrinapp:…</source>
        <translation>«%1$@» — не адрес вида tavrinapp:…</translation>
    </message>
    <message>
        <source>More than %@ addresses at once are not taken.</source>
        <translation>За один раз принимается не более %@ адресов.</translation>
    </message>
    <message>
        <source>An address of more than %@ characters names no document.</source>
        <translation>Адрес длиннее %@ символов не указывает на документ.</translation>
    </message>
    <message>
        <source>The request is damaged and was not taken.</source>
        <translation>Запрос повреждён и не принят.</translation>
    </message>
    <message>
        <source>The folder “%1$@” belongs to somebody else. Remove it, or have it removed, and start again.</source>
        <translation>Папка «%1$@» принадлежит другому пользователю. Удалите её (или попросите удалить) и запустите программу снова.</translation>
    </message>
    <!-- A WebDAV server -->
    <message>
        <source>This is not the address of a server. It begins with “https://”.</source>
        <translation>Это не адрес сервера. Он начинается с «https://».</translation>
    </message>
    <message>
        <source>The address of a WebDAV server begins with “https://” or “http://”.</source>
        <translation>Адрес сервера WebDAV начинается с «https://» или «http://».</translation>
    </message>
    <message>
        <source>Give the user and the password apart from the address.</source>
        <translation>Укажите пользователя и пароль отдельно от адреса.</translation>
    </message>
    <message>
        <source>The address of a WebDAV folder has neither a “?” nor a “#” in it.</source>
        <translation>В адресе папки WebDAV нет ни «?», ни «#».</translation>
    </message>
    <message>
        <source>The path in the address is not well-formed.</source>
        <translation>Путь в адресе записан неверно.</translation>
    </message>
    <message>
        <source>The name is not valid UTF-8, and a WebDAV server takes no other.</source>
        <translation>Имя записано не в UTF-8, а других сервер WebDAV не принимает.</translation>
    </message>
    <message>
        <source>The server does not list names that begin with a dot, so that the item would look deleted.</source>
        <translation>Сервер не показывает имена, начинающиеся с точки: объект выглядел бы удалённым.</translation>
    </message>
    <message>
        <source>The account on the server takes no changes; “%1$@” stays as it is there.</source>
        <translation>Учётная запись на сервере не принимает изменений; «%1$@» остаётся там как есть.</translation>
    </message>
    <message>
        <source>The server replaces what stands at a name without being asked to. Nothing is changed on it.</source>
        <translation>Сервер без спроса заменяет то, что занимает имя. На нём ничего не изменяется.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being replaced. What was there lies at “%2$@” on the server.</source>
        <translation>«%1$@» изменился во время замены. То, что там было, лежит на сервере в «%2$@».</translation>
    </message>
    <message>
        <source>The server's list of “%1$@” makes no sense. Nothing is concluded from it; it is asked again later.</source>
        <translation>Список «%1$@» от сервера не имеет смысла. Выводов из него не делается; запрос повторится позже.</translation>
    </message>
    <message>
        <source>The server's list of a folder is not whole or not well-formed. Nothing is concluded from it; it is asked again later.</source>
        <translation>Список папки от сервера неполон или записан неверно. Выводов из него не делается; запрос повторится позже.</translation>
    </message>
    <message>
        <source>Its name is not valid UTF-8.</source>
        <translation>Его имя записано не в UTF-8.</translation>
    </message>
    <message>
        <source>The server does not allow it to be read.</source>
        <translation>Сервер не разрешает его читать.</translation>
    </message>
    <message>
        <source>The server does not tell its size.</source>
        <translation>Сервер не сообщает его размер.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot be reached. Check the network and the address.</source>
        <translation>Сервер «%1$@» недоступен. Проверьте сеть и адрес.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot prove who it is: its certificate is not valid or not known here. Nothing was sent to it.</source>
        <translation>Сервер «%1$@» не может доказать, кто он: его сертификат недействителен или здесь неизвестен. Ему ничего не отправлено.</translation>
    </message>
    <message>
        <source>The server “%1$@” does not answer any more. It is tried again.</source>
        <translation>Сервер «%1$@» больше не отвечает. Попытка будет повторена.</translation>
    </message>
    <message>
        <source>The connection to the server “%1$@” broke off. It is tried again.</source>
        <translation>Связь с сервером «%1$@» прервалась. Попытка будет повторена.</translation>
    </message>
    <message>
        <source>The server does not accept the user or the password. Sign in again.</source>
        <translation>Сервер не принимает пользователя или пароль. Войдите снова.</translation>
    </message>
    <message>
        <source>The server sends on to “%1$@”, which is not followed. Sign in with that address if it is the right one.</source>
        <translation>Сервер отсылает к «%1$@», туда программа не идёт. Войдите с этим адресом, если он верен.</translation>
    </message>
    <message>
        <source>The server is busy and asks to be left alone for %1$@ seconds. Everything waits until then.</source>
        <translation>Сервер занят и просит подождать %1$@ с. До тех пор всё ждёт.</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be changed.</source>
        <translation>Сервер не разрешает изменить «%1$@».</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be read.</source>
        <translation>Сервер не разрешает читать «%1$@».</translation>
    </message>
    <message>
        <source>The server takes no file as large as “%1$@”.</source>
        <translation>Сервер не принимает таких больших файлов, как «%1$@».</translation>
    </message>
    <message>
        <source>“%1$@” is locked on the server by another program. It is tried again.</source>
        <translation>«%1$@» заблокирован на сервере другой программой. Попытка будет повторена.</translation>
    </message>
    <message>
        <source>The server does not reach what stands behind it. It is tried again.</source>
        <translation>Сервер не достигает того, что стоит за ним. Попытка будет повторена.</translation>
    </message>
    <message>
        <source>The server refused a request for “%1$@” (%2$@). It is tried again.</source>
        <translation>Сервер отклонил запрос о «%1$@» (%2$@). Попытка будет повторена.</translation>
    </message>
    <message>
        <source>The server sends “%1$@” in an encoding that was not asked for.</source>
        <translation>Сервер присылает «%1$@» в кодировке, о которой не просили.</translation>
    </message>
    <message>
        <source>What the server sent of “%1$@” does not have the checksum that the server gives. It is tried again.</source>
        <translation>Присланное сервером содержимое «%1$@» не совпадает с его контрольной суммой. Попытка будет повторена.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Nothing is changed until it is back.</source>
        <translation>То, что сейчас находится по адресу «%1$@», — не то, с чем была связана эта учётная запись. Ничего не изменяется, пока оно не вернётся.</translation>
    </message>
    <message>
        <source>The name is too long for the server.</source>
        <translation>Имя слишком длинное для сервера.</translation>
    </message>
    <message>
        <source>The server answers for “%1$@”, and not as a WebDAV server does. Check the address: it is that of a folder, and often longer than that of the site.</source>
        <translation>Сервер отвечает по адресу «%1$@», но не как сервер WebDAV. Проверьте адрес: это адрес папки, и часто он длиннее адреса сайта.</translation>
    </message>
    <message>
        <source>There is nothing at “%1$@” on the server. Check the address.</source>
        <translation>По адресу «%1$@» на сервере ничего нет. Проверьте адрес.</translation>
    </message>
    <message>
        <source>The server does not allow the folder “%1$@” to be read.</source>
        <translation>Сервер не разрешает читать папку «%1$@».</translation>
    </message>
    <message>
        <source>The server has a fault of its own and does not answer for “%1$@”. It is tried again.</source>
        <translation>На сервере неполадка, и по адресу «%1$@» он не отвечает. Попытка будет повторена.</translation>
    </message>
</context>
<!-- The menu of a text field is the toolkit's own. -->
<context>
    <name>QLineEdit</name>
    <message>
        <source>&amp;Undo</source>
        <translation>&amp;Отменить</translation>
    </message>
    <message>
        <source>&amp;Redo</source>
        <translation>&amp;Повторить</translation>
    </message>
    <message>
        <source>Cu&amp;t</source>
        <translation>&amp;Вырезать</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;Скопировать</translation>
    </message>
    <message>
        <source>&amp;Paste</source>
        <translation>Вст&amp;авить</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>Удалить</translation>
    </message>
    <message>
        <source>Select All</source>
        <translation>Выбрать всё</translation>
    </message>
</context>
</TS>
