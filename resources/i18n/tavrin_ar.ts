<?xml version="1.0" encoding="utf-8"?>
<!DOCTYPE TS>
<TS version="2.1" language="ar" sourcelanguage="en_US">
<context>
    <name>tavrin</name>
    <message numerus="yes">
        <source>.DICT.BYTES.%d</source>
        <translation>
            <numerusform>%n بايت</numerusform>
            <numerusform>بايت واحد</numerusform>
            <numerusform>بايتان</numerusform>
            <numerusform>%n بايتات</numerusform>
            <numerusform>%n بايتًا</numerusform>
            <numerusform>%n بايت</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS.%d</source>
        <translation>
            <numerusform>لا عناصر</numerusform>
            <numerusform>عنصر واحد</numerusform>
            <numerusform>عنصران</numerusform>
            <numerusform>%n عناصر</numerusform>
            <numerusform>%n عنصرًا</numerusform>
            <numerusform>%n عنصر</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.ITEMS_SELECTED.%d</source>
        <translation>
            <numerusform>لم يُحدد أي عنصر</numerusform>
            <numerusform>تم تحديد عنصر واحد</numerusform>
            <numerusform>تم تحديد عنصرين</numerusform>
            <numerusform>تم تحديد %n عناصر</numerusform>
            <numerusform>تم تحديد %n عنصرًا</numerusform>
            <numerusform>تم تحديد %n عنصر</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>نقل %n عنصر</numerusform>
            <numerusform>نقل عنصر واحد</numerusform>
            <numerusform>نقل عنصرين</numerusform>
            <numerusform>نقل %n عناصر</numerusform>
            <numerusform>نقل %n عنصرًا</numerusform>
            <numerusform>نقل %n عنصر</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_MOVE_ITEMS.%d</source>
        <translation>
            <numerusform>تعذر نقل %n عنصر.</numerusform>
            <numerusform>تعذر نقل عنصر واحد.</numerusform>
            <numerusform>تعذر نقل عنصرين.</numerusform>
            <numerusform>تعذر نقل %n عناصر.</numerusform>
            <numerusform>تعذر نقل %n عنصرًا.</numerusform>
            <numerusform>تعذر نقل %n عنصر.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.CANNOT_DELETE_ITEMS.%d</source>
        <translation>
            <numerusform>تعذر حذف %n عنصر.</numerusform>
            <numerusform>تعذر حذف عنصر واحد.</numerusform>
            <numerusform>تعذر حذف عنصرين.</numerusform>
            <numerusform>تعذر حذف %n عناصر.</numerusform>
            <numerusform>تعذر حذف %n عنصرًا.</numerusform>
            <numerusform>تعذر حذف %n عنصر.</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.SENDING.%d</source>
        <translation>
            <numerusform>لا يُرسل أي مستند</numerusform>
            <numerusform>جارٍ إرسال مستند واحد</numerusform>
            <numerusform>جارٍ إرسال مستندين</numerusform>
            <numerusform>جارٍ إرسال %n مستندات</numerusform>
            <numerusform>جارٍ إرسال %n مستندًا</numerusform>
            <numerusform>جارٍ إرسال %n مستند</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.RECEIVING.%d</source>
        <translation>
            <numerusform>لا يُستلم أي مستند</numerusform>
            <numerusform>جارٍ استلام مستند واحد</numerusform>
            <numerusform>جارٍ استلام مستندين</numerusform>
            <numerusform>جارٍ استلام %n مستندات</numerusform>
            <numerusform>جارٍ استلام %n مستندًا</numerusform>
            <numerusform>جارٍ استلام %n مستند</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.MORE.%d</source>
        <translation>
            <numerusform>ولا شيء آخر</numerusform>
            <numerusform>وواحد آخر</numerusform>
            <numerusform>واثنان آخران</numerusform>
            <numerusform>و%n أخرى</numerusform>
            <numerusform>و%n أخرى</numerusform>
            <numerusform>و%n أخرى</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.WAITING.%d</source>
        <translation>
            <numerusform>لا مستندات تنتظر</numerusform>
            <numerusform>مستند واحد ينتظر</numerusform>
            <numerusform>مستندان ينتظران</numerusform>
            <numerusform>%n مستندات تنتظر</numerusform>
            <numerusform>%n مستندًا ينتظر</numerusform>
            <numerusform>%n مستند ينتظر</numerusform>
        </translation>
    </message>
    <message numerus="yes">
        <source>.DICT.AVAILABLE.%g</source>
        <translation>
            <numerusform>المتاح %@</numerusform>
            <numerusform>المتاح %@</numerusform>
            <numerusform>المتاح %@</numerusform>
            <numerusform>المتاح %@</numerusform>
            <numerusform>المتاح %@</numerusform>
            <numerusform>المتاح %@</numerusform>
        </translation>
    </message>
    <!-- Names, sizes, places -->
    <message>
        <source>%@ KB</source>
        <translation>%@&#xa0;كيلوبايت</translation>
    </message>
    <message>
        <source>%@ MB</source>
        <translation>%@&#xa0;ميغابايت</translation>
    </message>
    <message>
        <source>%@ GB</source>
        <translation>%@&#xa0;غيغابايت</translation>
    </message>
    <message>
        <source>%@ TB</source>
        <translation>%@&#xa0;تيرابايت</translation>
    </message>
    <message>
        <source>%@ PB</source>
        <translation>%@&#xa0;بيتابايت</translation>
    </message>
    <message>
        <source>%@ EB</source>
        <translation>%@&#xa0;إكسابايت</translation>
    </message>
    <message>
        <source>%1$@ of %2$@</source>
        <translation>%1$@ من %2$@</translation>
    </message>
    <message>
        <source>%1$@, %2$@</source>
        <translation>%1$@، %2$@</translation>
    </message>
    <message>
        <source>Documents</source>
        <translation>المستندات</translation>
    </message>
    <message>
        <source>Kind</source>
        <translation>النوع</translation>
    </message>
    <message>
        <source>Size</source>
        <translation>الحجم</translation>
    </message>
    <message>
        <source>Where</source>
        <translation>الموقع</translation>
    </message>
    <message>
        <source>Created</source>
        <translation>تاريخ الإنشاء</translation>
    </message>
    <message>
        <source>Modified</source>
        <translation>تاريخ التعديل</translation>
    </message>
    <message>
        <source>Tags</source>
        <translation>الوسوم</translation>
    </message>
    <message>
        <source>Shared</source>
        <translation>مشترك</translation>
    </message>
    <!-- Kinds of documents -->
    <message>
        <source>Document</source>
        <translation>مستند</translation>
    </message>
    <message>
        <source>Folder</source>
        <translation>مجلد</translation>
    </message>
    <message>
        <source>Package</source>
        <translation>حزمة</translation>
    </message>
    <message>
        <source>Rich text document with attachments</source>
        <translation>نص منسق مع مرفقات</translation>
    </message>
    <message>
        <source>Document package</source>
        <translation>حزمة مستند</translation>
    </message>
    <message>
        <source>Text</source>
        <translation>نص</translation>
    </message>
    <message>
        <source>Source code</source>
        <translation>شفرة مصدرية</translation>
    </message>
    <message>
        <source>Image</source>
        <translation>صورة</translation>
    </message>
    <message>
        <source>Movie</source>
        <translation>فيديو</translation>
    </message>
    <message>
        <source>Audio</source>
        <translation>صوت</translation>
    </message>
    <message>
        <source>Audio or video</source>
        <translation>صوت أو فيديو</translation>
    </message>
    <message>
        <source>Archive</source>
        <translation>أرشيف</translation>
    </message>
    <message>
        <source>Font</source>
        <translation>خط</translation>
    </message>
    <!-- Buttons and actions -->
    <message>
        <source>OK</source>
        <translation>موافق</translation>
    </message>
    <message>
        <source>Cancel</source>
        <translation>إلغاء</translation>
    </message>
    <message>
        <source>Done</source>
        <translation>تم</translation>
    </message>
    <message>
        <source>Create</source>
        <translation>إنشاء</translation>
    </message>
    <message>
        <source>Back</source>
        <translation>رجوع</translation>
    </message>
    <message>
        <source>More</source>
        <translation>المزيد</translation>
    </message>
    <message>
        <source>Info</source>
        <translation>معلومات</translation>
    </message>
    <message>
        <source>Select</source>
        <translation>تحديد</translation>
    </message>
    <message>
        <source>Select Items</source>
        <translation>تحديد العناصر</translation>
    </message>
    <message>
        <source>Move</source>
        <translation>نقل</translation>
    </message>
    <message>
        <source>Move Here</source>
        <translation>نقل إلى هنا</translation>
    </message>
    <message>
        <source>Move to Folder…</source>
        <translation>نقل إلى مجلد…</translation>
    </message>
    <message>
        <source>Move “%1$@”</source>
        <translation>نقل «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>حذف</translation>
    </message>
    <message>
        <source>Delete from Tavrin</source>
        <translation>حذف من Tavrin</translation>
    </message>
    <message>
        <source>Rename</source>
        <translation>إعادة تسمية</translation>
    </message>
    <message>
        <source>Rename Item</source>
        <translation>إعادة تسمية العنصر</translation>
    </message>
    <message>
        <source>Rename Item…</source>
        <translation>إعادة تسمية العنصر…</translation>
    </message>
    <message>
        <source>Share</source>
        <translation>مشاركة</translation>
    </message>
    <message>
        <source>Share Item…</source>
        <translation>مشاركة العنصر…</translation>
    </message>
    <message>
        <source>Copy</source>
        <translation>نسخ</translation>
    </message>
    <message>
        <source>Copy Path</source>
        <translation>نسخ المسار</translation>
    </message>
    <message>
        <source>Send by Mail</source>
        <translation>إرسال بالبريد</translation>
    </message>
    <message>
        <source>Open in “%@”</source>
        <translation>فتح في «&#x2068;%@&#x2069;»</translation>
    </message>
    <message>
        <source>Open in “%1$@”</source>
        <translation>فتح في «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>Search</source>
        <translation>بحث</translation>
    </message>
    <message>
        <source>Try Again</source>
        <translation>إعادة المحاولة</translation>
    </message>
    <message>
        <source>Clear text</source>
        <translation>مسح النص</translation>
    </message>
    <message>
        <source>Zoom in</source>
        <translation>تكبير</translation>
    </message>
    <message>
        <source>Zoom out</source>
        <translation>تصغير</translation>
    </message>
    <!-- New folders and names -->
    <message>
        <source>New Folder</source>
        <translation>مجلد جديد</translation>
    </message>
    <message>
        <source>Folder Name</source>
        <translation>اسم المجلد</translation>
    </message>
    <message>
        <source>Enter a name for this folder.</source>
        <translation>أدخل اسمًا لهذا المجلد.</translation>
    </message>
    <message>
        <source>Enter a new name for this item.</source>
        <translation>أدخل اسمًا جديدًا لهذا العنصر.</translation>
    </message>
    <message>
        <source>Character not allowed in filename</source>
        <translation>رمز غير مسموح به في اسم الملف</translation>
    </message>
    <message>
        <source>Choose a different name.</source>
        <translation>اختر اسمًا آخر.</translation>
    </message>
    <message>
        <source>The name “%@” is already taken.</source>
        <translation>الاسم «&#x2068;%@&#x2069;» مستخدم بالفعل.</translation>
    </message>
    <message>
        <source>The name “%1$@” with extension “.%2$@” is already taken.</source>
        <translation>الاسم «&#x2068;%1$@&#x2069;» بالامتداد «&#x2068;.%2$@&#x2069;» مستخدم بالفعل.</translation>
    </message>
    <message>
        <source>The name “%@” can’t be used. Try using a name with fewer characters, or with no punctuation marks.</source>
        <translation>لا يمكن استخدام الاسم «&#x2068;%@&#x2069;». جرّب اسمًا أقصر أو بلا علامات ترقيم.</translation>
    </message>
    <message>
        <source>The folder could not be made.</source>
        <translation>تعذر إنشاء المجلد.</translation>
    </message>
    <!-- Deleting -->
    <message>
        <source>%@ will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>سيُحذف نهائيًا من Tavrin على جميع أجهزتك: %@. لا يمكن التراجع عن هذا الإجراء.</translation>
    </message>
    <message>
        <source>&quot;%@&quot; will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>سيُحذف «&#x2068;%@&#x2069;» نهائيًا من Tavrin على جميع أجهزتك. لا يمكن التراجع عن هذا الإجراء.</translation>
    </message>
    <message>
        <source>The %@ app library, and all its documents, will be permanently deleted from Tavrin on all your devices. This action cannot be undone.</source>
        <translation>ستُحذف مكتبة التطبيق «&#x2068;%@&#x2069;» وجميع مستنداتها نهائيًا من Tavrin على جميع أجهزتك. لا يمكن التراجع عن هذا الإجراء.</translation>
    </message>
    <!-- Lists and the search -->
    <message>
        <source>No documents here</source>
        <translation>لا توجد مستندات هنا</translation>
    </message>
    <message>
        <source>What applications keep in the cloud appears here.</source>
        <translation>يظهر هنا ما تحفظه التطبيقات في السحابة.</translation>
    </message>
    <message>
        <source>Documents that are added to this folder, here or on another device, appear here.</source>
        <translation>تظهر هنا المستندات التي تُضاف إلى هذا المجلد من هذا الجهاز أو من جهاز آخر.</translation>
    </message>
    <message>
        <source>This folder is no longer here</source>
        <translation>لم يعد هذا المجلد هنا</translation>
    </message>
    <message>
        <source>This folder cannot be shown</source>
        <translation>لا يمكن عرض هذا المجلد</translation>
    </message>
    <message>
        <source>Search all documents</source>
        <translation>البحث في جميع المستندات</translation>
    </message>
    <message>
        <source>Type a part of a name</source>
        <translation>اكتب جزءًا من الاسم</translation>
    </message>
    <message>
        <source>Documents and folders of the whole store are found, also those that are not downloaded.</source>
        <translation>يشمل البحث مستندات المخزن ومجلداته كلها، حتى ما لم يُنزَّل منها.</translation>
    </message>
    <message>
        <source>Nothing found</source>
        <translation>لا توجد نتائج</translation>
    </message>
    <message>
        <source>No name in the store contains “%1$@”.</source>
        <translation>لا يوجد في المخزن اسم يحتوي على «&#x2068;%1$@&#x2069;».</translation>
    </message>
    <message>
        <source>Downloading</source>
        <translation>قيد التنزيل</translation>
    </message>
    <message>
        <source>Not downloaded</source>
        <translation>غير منزَّل</translation>
    </message>
    <!-- Choosing where to move -->
    <message>
        <source>Nothing here yet</source>
        <translation>لا شيء هنا بعد</translation>
    </message>
    <message>
        <source>An item with this name is here already.</source>
        <translation>يوجد هنا بالفعل عنصر بهذا الاسم.</translation>
    </message>
    <message>
        <source>Items with these names are here already.</source>
        <translation>توجد هنا بالفعل عناصر بهذه الأسماء.</translation>
    </message>
    <message>
        <source>Open the folder into which to move.</source>
        <translation>افتح المجلد الذي تريد النقل إليه.</translation>
    </message>
    <message>
        <source>This folder does not take documents.</source>
        <translation>لا يقبل هذا المجلد المستندات.</translation>
    </message>
    <message>
        <source>A folder cannot be moved into itself.</source>
        <translation>لا يمكن نقل مجلد إلى داخل نفسه.</translation>
    </message>
    <message>
        <source>“%1$@” is here already.</source>
        <translation>«&#x2068;%1$@&#x2069;» موجود هنا بالفعل.</translation>
    </message>
    <message>
        <source>These items are here already.</source>
        <translation>هذه العناصر موجودة هنا بالفعل.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders.</source>
        <translation>لا يقبل «&#x2068;%1$@&#x2069;» المجلدات.</translation>
    </message>
    <message>
        <source>“%1$@” does not take folders within folders.</source>
        <translation>لا يقبل «&#x2068;%1$@&#x2069;» المجلدات داخل المجلدات.</translation>
    </message>
    <message>
        <source>“%1$@” does not take documents of this kind.</source>
        <translation>لا يقبل «&#x2068;%1$@&#x2069;» المستندات من هذا النوع.</translation>
    </message>
    <message>
        <source>“%1$@” does not take all of these documents.</source>
        <translation>لا يقبل «&#x2068;%1$@&#x2069;» جميع هذه المستندات.</translation>
    </message>
    <!-- Showing and downloading -->
    <message>
        <source>Loading…</source>
        <translation>جارٍ التحميل…</translation>
    </message>
    <message>
        <source>Waiting…</source>
        <translation>قيد الانتظار…</translation>
    </message>
    <message>
        <source>Download</source>
        <translation>تنزيل</translation>
    </message>
    <message>
        <source>Download to View</source>
        <translation>تنزيل للعرض</translation>
    </message>
    <message>
        <source>Cancel Download</source>
        <translation>إلغاء التنزيل</translation>
    </message>
    <message>
        <source>Downloading “%1$@”</source>
        <translation>تنزيل «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>This item is over %@.</source>
        <translation>حجم هذا العنصر أكبر من %@.</translation>
    </message>
    <message>
        <source>“%@” will not download until you connect to Wi-Fi.</source>
        <translation>لن يتم تنزيل «&#x2068;%@&#x2069;» حتى تتصل بشبكة Wi-Fi.</translation>
    </message>
    <message>
        <source>Unable to download file. You are no longer connected to the Internet.</source>
        <translation>تعذر تنزيل الملف. لم تعد متصلًا بالإنترنت.</translation>
    </message>
    <message>
        <source>Picture “%1$@”</source>
        <translation>الصورة «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>There is no document to show</source>
        <translation>لا يوجد مستند لعرضه</translation>
    </message>
    <message>
        <source>This kind of document cannot be shown here.</source>
        <translation>لا يمكن عرض هذا النوع من المستندات هنا.</translation>
    </message>
    <message>
        <source>“%1$@” is too large to be shown here.</source>
        <translation>«%1$@» كبير جدًا بحيث لا يمكن عرضه هنا.</translation>
    </message>
    <message>
        <source>There is no application for it on this device.</source>
        <translation>لا يوجد تطبيق لذلك على هذا الجهاز.</translation>
    </message>
    <message>
        <source>This document cannot be shown.</source>
        <translation>لا يمكن عرض هذا المستند.</translation>
    </message>
    <message>
        <source>This document is protected by a password. It can be read in an application that asks for it.</source>
        <translation>هذا المستند محمي بكلمة سر. يمكن قراءته في تطبيق يطلبها.</translation>
    </message>
    <message>
        <source>This is a folder, not a document.</source>
        <translation>هذا مجلد وليس مستندًا.</translation>
    </message>
    <message>
        <source>There is nothing in this document.</source>
        <translation>هذا المستند فارغ.</translation>
    </message>
    <message>
        <source>Open With…</source>
        <translation>فتح باستخدام…</translation>
    </message>
    <message>
        <source>“%1$@” cannot be played. It may be damaged, or of a kind for which there is no decoder here.</source>
        <translation>تعذّر تشغيل «⁨%1$@⁩». ربما يكون تالفًا أو من نوع لا يوجد له مفكّك ترميز هنا.</translation>
    </message>
    <message>
        <source>Sound and films cannot be played: a part of this program is missing. Install it again.</source>
        <translation>لا يمكن تشغيل الصوت والأفلام: جزء من هذا البرنامج مفقود. أعد تثبيته.</translation>
    </message>
    <message>
        <source>There is no device here to hear the sound from.</source>
        <translation>لا يوجد هنا جهاز لسماع الصوت.</translation>
    </message>
    <message>
        <source>Play</source>
        <translation>تشغيل</translation>
    </message>
    <message>
        <source>Pause</source>
        <translation>إيقاف مؤقت</translation>
    </message>
    <message>
        <source>Mute</source>
        <translation>كتم الصوت</translation>
    </message>
    <message>
        <source>Unmute</source>
        <translation>إلغاء كتم الصوت</translation>
    </message>
    <message>
        <source>Position</source>
        <translation>الموضع</translation>
    </message>
    <message>
        <source>Volume</source>
        <translation>مستوى الصوت</translation>
    </message>
    <message>
        <source>“%1$@” cannot be shown. It may be damaged, or need a password.</source>
        <translation>تعذّر عرض «⁨%1$@⁩». ربما يكون تالفًا أو يحتاج إلى كلمة مرور.</translation>
    </message>
    <message>
        <source>This document is too large to be shown here.</source>
        <translation>هذا المستند أكبر من أن يُعرض هنا.</translation>
    </message>
    <message>
        <source>It takes too long to show this document here.</source>
        <translation>يستغرق عرض هذا المستند هنا وقتًا طويلًا جدًا.</translation>
    </message>
    <message>
        <source>This document consists of several files. A program that knows its kind shows them as one.</source>
        <translation>يتكون هذا المستند من عدة ملفات. البرنامج الذي يعرف نوعه يعرضها كمستند واحد.</translation>
    </message>
    <message>
        <source>There is more in this document than is listed here.</source>
        <translation>في هذا المستند أكثر مما هو معروض هنا.</translation>
    </message>
    <message>
        <source>%1$@, %2$@ unpacked</source>
        <translation>%1$@، %2$@ بعد فك الضغط</translation>
    </message>
    <message>
        <source>Still being read. This is what there is so far.</source>
        <translation>ما زالت القراءة جارية. هذا ما قُرئ حتى الآن.</translation>
    </message>
    <message>
        <source>The archive is damaged. This is what could be read before the damage.</source>
        <translation>الأرشيف تالف. هذا ما أمكنت قراءته قبل موضع التلف.</translation>
    </message>
    <message>
        <source>There is more in this archive than is listed here.</source>
        <translation>في هذا الأرشيف أكثر مما هو معروض هنا.</translation>
    </message>
    <message>
        <source>Unpacking it takes a password.</source>
        <translation>يتطلب فك الضغط كلمة مرور.</translation>
    </message>
    <message>
        <source>What is in this archive can only be seen with its password.</source>
        <translation>لا يمكن رؤية محتوى هذا الأرشيف إلا بكلمة مروره.</translation>
    </message>
    <message>
        <source>There is nothing in this archive.</source>
        <translation>هذا الأرشيف فارغ.</translation>
    </message>
    <message>
        <source>A part of this program is missing: archives cannot be listed. Install it again.</source>
        <translation>جزء من هذا البرنامج مفقود: لا يمكن سرد محتويات الأرشيفات. أعد تثبيته.</translation>
    </message>
    <message>
        <source>A part of this program is missing: drawings cannot be shown. Install it again.</source>
        <translation>جزء من هذا البرنامج مفقود: لا يمكن عرض الرسوم. أعد تثبيته.</translation>
    </message>
    <message>
        <source>Encrypted</source>
        <translation>مشفّر</translation>
    </message>
    <message>
        <source>Link</source>
        <translation>رابط</translation>
    </message>
    <message>
        <source>This document is not on this device. Download it first.</source>
        <translation>هذا المستند ليس على هذا الجهاز. نزّله أولًا.</translation>
    </message>
    <message>
        <source>“%1$@” is damaged, or not what its name says.</source>
        <translation>«&#x2068;%1$@&#x2069;» تالف أو لا يطابق ما يدل عليه اسمه.</translation>
    </message>
    <message>
        <source>“%1$@” could not be opened</source>
        <translation>تعذر فتح «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>“%1$@” could not be copied</source>
        <translation>تعذر نسخ «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>“%1$@” could not be sent</source>
        <translation>تعذر إرسال «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>“%1$@” could not be started. %2$@</source>
        <translation>تعذر تشغيل «&#x2068;%1$@&#x2069;». %2$@</translation>
    </message>
    <message>
        <source>“%1$@” ended as soon as it had been started (exit status %2$@).</source>
        <translation>انتهى «&#x2068;%1$@&#x2069;» فور تشغيله (رمز الخروج %2$@).</translation>
    </message>
    <!-- The account and the network -->
    <message>
        <source>Offline</source>
        <translation>غير متصل</translation>
    </message>
    <message>
        <source>Cellular</source>
        <translation>شبكة خلوية</translation>
    </message>
    <message>
        <source>Wi-Fi</source>
        <translation>Wi-Fi</translation>
    </message>
    <message>
        <source>Network activity</source>
        <translation>نشاط الشبكة</translation>
    </message>
    <message>
        <source>Not signed in</source>
        <translation>لم يُسجَّل الدخول</translation>
    </message>
    <message>
        <source>Pelmora is not enabled</source>
        <translation>لم يتم تفعيل Pelmora</translation>
    </message>
    <message>
        <source>Sign in to a folder that holds your documents, such as a disk or a network folder. In a terminal, type:</source>
        <translation>سجّل الدخول إلى مجلد يحوي مستنداتك، كقرص أو مجلد على الشبكة. اكتب في نافذة الأوامر:</translation>
    </message>
    <message>
        <source>PATH is that folder. The documents appear here as soon as you are signed in.</source>
        <translation>&#x200f;PATH هو ذلك المجلد. تظهر المستندات هنا فور تسجيل دخولك.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in.</source>
        <translation>لم يُسجَّل الدخول إلى أي حساب Pelmora.</translation>
    </message>
    <message>
        <source>No Pelmora account is signed in. Sign in with the command “pelmora sign-in”.</source>
        <translation>لم يُسجَّل الدخول إلى أي حساب Pelmora. سجّل الدخول بالأمر «&#x2068;pelmora sign-in&#x2069;».</translation>
    </message>
    <message>
        <source>The account is of the kind “%1$@”, which this version does not know. Update the program or sign in again.</source>
        <translation>الحساب من النوع «&#x2068;%1$@&#x2069;» الذي لا يعرفه هذا الإصدار. حدّث البرنامج أو سجّل الدخول من جديد.</translation>
    </message>
    <message>
        <source>This version cannot use accounts of the kind “%1$@” yet. Update the program or sign in to a folder.</source>
        <translation>لا يستطيع هذا الإصدار بعد استخدام الحسابات من النوع «&#x2068;%1$@&#x2069;». حدّث البرنامج أو سجّل الدخول إلى مجلد.</translation>
    </message>
    <message>
        <source>The account's folder “%1$@” is not an absolute path. Sign in again with the whole path.</source>
        <translation>مجلد الحساب «&#x2068;%1$@&#x2069;» ليس مسارًا مطلقًا. سجّل الدخول من جديد بالمسار الكامل.</translation>
    </message>
    <message>
        <source>The account file “%1$@” does not say who is signed in. Sign in again.</source>
        <translation>لا يذكر ملف الحساب «&#x2068;%1$@&#x2069;» صاحب الحساب. سجّل الدخول من جديد.</translation>
    </message>
    <message>
        <source>The account file “%1$@” cannot be read. Check its permissions.</source>
        <translation>لا يمكن قراءة ملف الحساب «&#x2068;%1$@&#x2069;». تحقق من أذوناته.</translation>
    </message>
    <message>
        <source>The account file “%1$@” is damaged. Sign in again.</source>
        <translation>ملف الحساب «&#x2068;%1$@&#x2069;» تالف. سجّل الدخول من جديد.</translation>
    </message>
    <message>
        <source>The folder “%1$@” of your Pelmora account is not there. Connect its disk, or sign in again if it has moved.</source>
        <translation>المجلد «&#x2068;%1$@&#x2069;» لحسابك في Pelmora غير موجود. وصّل قرصه، أو سجّل الدخول من جديد إن كان قد نُقل.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Connect the right disk, or sign in to another folder.</source>
        <translation>الموجود الآن في «&#x2068;%1$@&#x2069;» ليس ما رُبط به هذا الحساب. وصّل القرص الصحيح، أو سجّل الدخول إلى مجلد آخر.</translation>
    </message>
    <message>
        <source>The file “%1$@” of the account is damaged. Repair or remove it.</source>
        <translation>الملف «&#x2068;%1$@&#x2069;» في الحساب تالف. أصلحه أو أزله.</translation>
    </message>
    <message>
        <source>The account does not tell how much room is left.</source>
        <translation>لا يُبلغ الحساب عن المساحة المتبقية.</translation>
    </message>
    <message>
        <source>The Pelmora server cannot be reached. Check the connection and try again.</source>
        <translation>لا يمكن الوصول إلى خادم Pelmora. تحقق من الاتصال وأعد المحاولة.</translation>
    </message>
    <message>
        <source>The Pelmora server did not accept the user name or the password.</source>
        <translation>لم يقبل خادم Pelmora اسم المستخدم أو كلمة السر.</translation>
    </message>
    <message>
        <source>The Pelmora server refused the request for “%1$@”.</source>
        <translation>رفض خادم Pelmora الطلب الخاص بـ«&#x2068;%1$@&#x2069;».</translation>
    </message>
    <message>
        <source>The Pelmora server cannot store an item named “%1$@”. Choose a different name.</source>
        <translation>لا يستطيع خادم Pelmora حفظ عنصر باسم «&#x2068;%1$@&#x2069;». اختر اسمًا آخر.</translation>
    </message>
    <message>
        <source>There is no space left in your Pelmora account. Delete something to make room.</source>
        <translation>لم تعد هناك مساحة في حسابك في Pelmora. احذف شيئًا لإفساح المجال.</translation>
    </message>
    <message>
        <source>The file of passwords “%1$@” is damaged. Move it away and sign in again.</source>
        <translation>ملف كلمات المرور «&#x2068;%1$@&#x2069;» تالف. انقله إلى مكان آخر وسجّل الدخول من جديد.</translation>
    </message>
    <message>
        <source>The keyring does not answer. Unlock it, or restart its service, and try again.</source>
        <translation>لا تستجيب حلقة المفاتيح. افتح قفلها أو أعد تشغيل خدمتها ثم حاول مرة أخرى.</translation>
    </message>
    <message>
        <source>The keyring refused (%1$@). Unlock it and try again.</source>
        <translation>رفضت حلقة المفاتيح (&#x2068;%1$@&#x2069;). افتح قفلها ثم حاول مرة أخرى.</translation>
    </message>
    <message>
        <source>There is no keyring on this desk that could keep the password.</source>
        <translation>لا توجد على هذا الجهاز حلقة مفاتيح يمكنها حفظ كلمة المرور.</translation>
    </message>
    <message>
        <source>The store has work in it that was interrupted. Use it once more, so that it comes to its end, and sign out then.</source>
        <translation>في المخزن عمل لم يكتمل. استخدمه مرة أخرى حتى ينتهي ثم سجّل الخروج.</translation>
    </message>
    <message>
        <source>Waits for a network that is not metered. “Sync Now” does not wait.</source>
        <translation>ينتظر شبكة غير محدودة الاستخدام. «المزامنة الآن» لا تنتظر.</translation>
    </message>
    <message>
        <source>Your documents can be on a server, or in a folder such as a disk or a network folder.</source>
        <translation>يمكن أن تكون مستنداتك على خادم أو في مجلد، مثل قرص أو مجلد شبكة.</translation>
    </message>
    <message>
        <source>Sending “%1$@”</source>
        <translation>جارٍ إرسال «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>Receiving “%1$@”</source>
        <translation>جارٍ استلام «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>“%1$@”: %2$@</source>
        <translation>«&#x2068;%1$@&#x2069;»: &#x2068;%2$@&#x2069;</translation>
    </message>
    <message>
        <source>%1$@ at %2$@</source>
        <translation>&#x2068;%1$@&#x2069; على &#x2068;%2$@&#x2069;</translation>
    </message>
    <message>
        <source>Account</source>
        <translation>الحساب</translation>
    </message>
    <message>
        <source>On Its Way</source>
        <translation>قيد النقل</translation>
    </message>
    <message>
        <source>Waiting</source>
        <translation>قيد الانتظار</translation>
    </message>
    <message>
        <source>Sync Now</source>
        <translation>المزامنة الآن</translation>
    </message>
    <message>
        <source>Sign In to Another Account…</source>
        <translation>تسجيل الدخول إلى حساب آخر…</translation>
    </message>
    <message>
        <source>Sign Out…</source>
        <translation>تسجيل الخروج…</translation>
    </message>
    <message>
        <source>The Password Is Wanted</source>
        <translation>كلمة المرور مطلوبة</translation>
    </message>
    <message>
        <source>Enter Password…</source>
        <translation>إدخال كلمة المرور…</translation>
    </message>
    <message>
        <source>Delete on Both Sides</source>
        <translation>الحذف من الجانبين</translation>
    </message>
    <message>
        <source>Changed on Both Sides</source>
        <translation>تغيّر في الجانبين</translation>
    </message>
    <message>
        <source>Show the First</source>
        <translation>إظهار الأول</translation>
    </message>
    <message>
        <source>Names That Cannot Be Kept</source>
        <translation>أسماء لا يمكن حفظها</translation>
    </message>
    <message>
        <source>Use “%1$@”</source>
        <translation>استخدام «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>The server does not accept the password that is kept here. Nothing is sent or received before it has the right one.</source>
        <translation>لا يقبل الخادم كلمة المرور المحفوظة هنا. لن يُرسل شيء أو يُستلم قبل إدخال كلمة المرور الصحيحة.</translation>
    </message>
    <message>
        <source>Both versions are kept side by side. Compare them and delete the one that you do not want.</source>
        <translation>النسختان محفوظتان جنبًا إلى جنب. قارن بينهما واحذف ما لا تريده.</translation>
    </message>
    <message>
        <source>Comparing both sides…</source>
        <translation>جارٍ مقارنة الجانبين…</translation>
    </message>
    <message>
        <source>Something waits. It is tried again by itself.</source>
        <translation>هناك ما ينتظر. ستُعاد المحاولة تلقائيًا.</translation>
    </message>
    <message>
        <source>Everything is on both sides.</source>
        <translation>كل شيء موجود في الجانبين.</translation>
    </message>
    <message>
        <source>Sign In to a Server…</source>
        <translation>تسجيل الدخول إلى خادم…</translation>
    </message>
    <message>
        <source>Use a Folder…</source>
        <translation>استخدام مجلد…</translation>
    </message>
    <message>
        <source>Sign Out of “%1$@”?</source>
        <translation>تسجيل الخروج من «&#x2068;%1$@&#x2069;»؟</translation>
    </message>
    <message>
        <source>The account keeps its documents. Those on this device can stay in their folder or be removed.</source>
        <translation>يحتفظ الحساب بمستنداته. أما ما على هذا الجهاز فيمكن إبقاؤه في مجلده أو إزالته.</translation>
    </message>
    <message>
        <source>Keep Files on This Device</source>
        <translation>إبقاء الملفات على هذا الجهاز</translation>
    </message>
    <message>
        <source>Remove Files from This Device</source>
        <translation>إزالة الملفات من هذا الجهاز</translation>
    </message>
    <message>
        <source>Some Documents Stayed on This Device</source>
        <translation>بقيت بعض المستندات على هذا الجهاز</translation>
    </message>
    <message>
        <source>Not Everything Has Been Sent</source>
        <translation>لم يُرسل كل شيء</translation>
    </message>
    <message>
        <source>These are on this device alone, so nothing was removed:</source>
        <translation>هذه موجودة على هذا الجهاز فقط، لذلك لم يُحذف شيء:</translation>
    </message>
    <message>
        <source>Keep Files and Sign Out</source>
        <translation>إبقاء الملفات وتسجيل الخروج</translation>
    </message>
    <message>
        <source>Stay Signed In</source>
        <translation>البقاء مسجلاً</translation>
    </message>
    <message>
        <source>Keep the Password in a File?</source>
        <translation>هل تُحفظ كلمة المرور في ملف؟</translation>
    </message>
    <message>
        <source>It can lie in a file that you alone may read. The file is not encrypted: whoever has this disk in his hands can read it.</source>
        <translation>يمكن حفظها في ملف لا يقرؤه سواك. الملف غير مشفّر: من يملك هذا القرص يستطيع قراءته.</translation>
    </message>
    <message>
        <source>Keep It in a File</source>
        <translation>حفظها في ملف</translation>
    </message>
    <message>
        <source>Password for “%1$@”</source>
        <translation>كلمة المرور لـ «&#x2068;%1$@&#x2069;»</translation>
    </message>
    <message>
        <source>Password</source>
        <translation>كلمة المرور</translation>
    </message>
    <message>
        <source>Sign In</source>
        <translation>تسجيل الدخول</translation>
    </message>
    <message>
        <source>Not Now</source>
        <translation>ليس الآن</translation>
    </message>
    <message>
        <source>Server</source>
        <translation>خادم</translation>
    </message>
    <message>
        <source>Your documents stay on a WebDAV server, such as one of your own or your company's.</source>
        <translation>تبقى مستنداتك على خادم WebDAV، كخادمك أو خادم شركتك.</translation>
    </message>
    <message>
        <source>Your documents stay in a folder of this machine, of a disk, or of a network.</source>
        <translation>تبقى مستنداتك في مجلد على هذا الجهاز أو على قرص أو في الشبكة.</translation>
    </message>
    <message>
        <source>Address</source>
        <translation>العنوان</translation>
    </message>
    <message>
        <source>Path of the Folder</source>
        <translation>مسار المجلد</translation>
    </message>
    <message>
        <source>User</source>
        <translation>المستخدم</translation>
    </message>
    <message>
        <source>File of Certificates to Trust</source>
        <translation>ملف الشهادات الموثوقة</translation>
    </message>
    <message>
        <source>Give the address of the server.</source>
        <translation>أدخل عنوان الخادم.</translation>
    </message>
    <message>
        <source>Give the folder of the account.</source>
        <translation>أدخل مجلد الحساب.</translation>
    </message>
    <message>
        <source>Give the name of the user.</source>
        <translation>أدخل اسم المستخدم.</translation>
    </message>
    <message>
        <source>The Way to This Server Is Not Encrypted</source>
        <translation>الاتصال بهذا الخادم غير مشفّر</translation>
    </message>
    <message>
        <source>Everybody on the way can read the password and the documents. Use an address that begins with “https://” if the server has one.</source>
        <translation>يستطيع أي شخص على الطريق قراءة كلمة المرور والمستندات. استخدم عنوانًا يبدأ بـ «https://» إن كان للخادم مثله.</translation>
    </message>
    <message>
        <source>Sign In Anyway</source>
        <translation>تسجيل الدخول على أي حال</translation>
    </message>
    <message>
        <source>Looking at the server…</source>
        <translation>جارٍ فحص الخادم…</translation>
    </message>
    <message>
        <source>Looking at the folder…</source>
        <translation>جارٍ فحص المجلد…</translation>
    </message>
    <message>
        <source>Signing in…</source>
        <translation>جارٍ تسجيل الدخول…</translation>
    </message>
    <message>
        <source>“%1$@” is not a folder. Make it first, or connect its disk.</source>
        <translation>«&#x2068;%1$@&#x2069;» ليس مجلدًا. أنشئه أولاً أو صِل قرصه.</translation>
    </message>
    <message>
        <source>The name of that folder is not UTF-8 text. Choose another folder.</source>
        <translation>اسم هذا المجلد ليس نصًا بترميز UTF-8. اختر مجلدًا آخر.</translation>
    </message>
    <message>
        <source>“%1$@” holds the stores of accounts themselves. Choose another folder.</source>
        <translation>يحتوي «&#x2068;%1$@&#x2069;» على مخازن الحسابات نفسها. اختر مجلدًا آخر.</translation>
    </message>
    <message>
        <source>“%1$@” lies in the store of an account. Choose another folder.</source>
        <translation>يقع «&#x2068;%1$@&#x2069;» داخل مخزن أحد الحسابات. اختر مجلدًا آخر.</translation>
    </message>
    <message>
        <source>There is no file of certificates at “%1$@”.</source>
        <translation>لا يوجد ملف شهادات في «&#x2068;%1$@&#x2069;».</translation>
    </message>
    <message>
        <source>The server lets you read here, and change nothing.</source>
        <translation>يسمح لك الخادم بالقراءة هنا ولا يسمح بالتغيير.</translation>
    </message>
    <message>
        <source>No password is kept here for this account.</source>
        <translation>لا توجد كلمة مرور محفوظة هنا لهذا الحساب.</translation>
    </message>
    <!-- The store and its documents -->
    <message>
        <source>The store has not been set up yet.</source>
        <translation>لم يُجهَّز المخزن بعد.</translation>
    </message>
    <message>
        <source>The store cannot be changed now.</source>
        <translation>لا يمكن تغيير المخزن الآن.</translation>
    </message>
    <message>
        <source>The store is in use by another program (process %1$@). Wait until it has finished, or close it.</source>
        <translation>المخزن قيد الاستخدام من برنامج آخر (العملية %1$@). انتظر حتى ينتهي، أو أغلقه.</translation>
    </message>
    <message>
        <source>The store was used by a later version of this program. Update the program to open it.</source>
        <translation>استُخدم المخزن بإصدار أحدث من هذا البرنامج. حدّث البرنامج لفتحه.</translation>
    </message>
    <message>
        <source>The store's records cannot be opened.</source>
        <translation>لا يمكن فتح سجلات المخزن.</translation>
    </message>
    <message>
        <source>The store's records were damaged. They were set aside as “%1$@” and are made anew from the disk and the account.</source>
        <translation>كانت سجلات المخزن تالفة. وُضعت جانبًا باسم «&#x2068;%1$@&#x2069;» وتُنشأ من جديد من القرص والحساب.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not the one that this store was made with. Put it back, or move “%2$@” away to begin anew; nothing was changed.</source>
        <translation>المجلد «&#x2068;%1$@&#x2069;» ليس الذي أُنشئ به هذا المخزن. أعِد المجلد الأصلي، أو أبعد «&#x2068;%2$@&#x2069;» للبدء من جديد؛ لم يتغير شيء.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be moved.</source>
        <translation>«&#x2068;%1$@&#x2069;» جزء من المخزن نفسه ولا يمكن نقله.</translation>
    </message>
    <message>
        <source>“%1$@” belongs to the store itself and cannot be deleted.</source>
        <translation>«&#x2068;%1$@&#x2069;» جزء من المخزن نفسه ولا يمكن حذفه.</translation>
    </message>
    <message>
        <source>“%1$@” has to be downloaded before it can leave your documents.</source>
        <translation>يجب تنزيل «&#x2068;%1$@&#x2069;» قبل إخراجه من مستنداتك.</translation>
    </message>
    <message>
        <source>“%1$@” stays on this device: your account does not have this version yet.</source>
        <translation>يبقى «&#x2068;%1$@&#x2069;» على هذا الجهاز: لا يملك حسابك هذا الإصدار بعد.</translation>
    </message>
    <message>
        <source>“%1$@” is no document that could be fetched again.</source>
        <translation>«&#x2068;%1$@&#x2069;» ليس مستندًا يمكن تنزيله من جديد.</translation>
    </message>
    <message>
        <source>“%1$@” has not been uploaded yet, so its copy on this device is kept.</source>
        <translation>لم يُرفع «&#x2068;%1$@&#x2069;» بعد، لذلك تبقى نسخته على هذا الجهاز.</translation>
    </message>
    <message>
        <source>“%1$@” was changed on another device. Both versions are kept.</source>
        <translation>تغيّر «&#x2068;%1$@&#x2069;» على جهاز آخر. ستبقى النسختان.</translation>
    </message>
    <!-- Why an item is left out -->
    <message>
        <source>It is a symbolic link.</source>
        <translation>إنه رابط رمزي.</translation>
    </message>
    <message>
        <source>It is neither a file nor a folder.</source>
        <translation>ليس ملفًا ولا مجلدًا.</translation>
    </message>
    <message>
        <source>It lies on another disk than the account's folder.</source>
        <translation>يقع على قرص غير قرص مجلد الحساب.</translation>
    </message>
    <message>
        <source>It lies on another disk than the store.</source>
        <translation>إنه على قرص غير قرص المخزن.</translation>
    </message>
    <message>
        <source>Delete or Bring Back?</source>
        <translation>حذف أم استعادة؟</translation>
    </message>
    <message>
        <source>Bring Them Back</source>
        <translation>استعادة العناصر</translation>
    </message>
    <message>
        <source>Delete on the Account Too</source>
        <translation>حذفها من الحساب أيضًا</translation>
    </message>
    <message>
        <source>Delete on This Device Too</source>
        <translation>حذفها من هذا الجهاز أيضًا</translation>
    </message>
    <message>
        <source>Decide Later</source>
        <translation>القرار لاحقًا</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from this device. Nothing is deleted on your account until you say so.</source>
        <translation>عدد العناصر التي اختفت من هذا الجهاز: %1$@. لن يُحذف شيء من حسابك حتى تقرّر ذلك.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so.</source>
        <translation>عدد العناصر التي اختفت من حسابك: %1$@. لن يُحذف شيء من هذا الجهاز حتى تقرّر ذلك.</translation>
    </message>
    <message>
        <source>“%1$@” is being written to without a pause. It will be on your account some moments after that has ended.</source>
        <translation>تجري الكتابة في «&#x2068;%1$@&#x2069;» دون توقّف. سيصل المستند إلى حسابك بعد لحظات من انتهاء ذلك.</translation>
    </message>
    <message>
        <source>Documents are being changed without a pause. What is new will be on your account some moments after that has ended.</source>
        <translation>تتغيّر المستندات دون توقّف. سيصل الجديد إلى حسابك بعد لحظات من انتهاء ذلك.</translation>
    </message>
    <message>
        <source>%1$@ items have vanished from your account. Nothing is deleted on this device until you say so. %2$@ of them have no copy on this device and cannot be brought back.</source>
        <translation>عدد العناصر التي اختفت من حسابك: %1$@. لن يُحذف شيء من هذا الجهاز حتى تقرّر ذلك. عدد ما ليست له منها نسخة على هذا الجهاز ولا يمكن استرجاعه: %2$@.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not there. Connect its disk; nothing was changed.</source>
        <translation>المجلد «%1$@» غير موجود. صِل قرصه؛ لم يتغيّر شيء.</translation>
    </message>
    <message>
        <source>The disk cannot have an item of that name.</source>
        <translation>لا يمكن أن يحوي القرص عنصرًا بهذا الاسم.</translation>
    </message>
    <message>
        <source>The name is too long for the disk.</source>
        <translation>الاسم أطول مما يسمح به القرص.</translation>
    </message>
    <message>
        <source>The name is one that the store uses itself.</source>
        <translation>يستخدم المخزن نفسه هذا الاسم.</translation>
    </message>
    <message>
        <source>The name is one that the account uses itself.</source>
        <translation>يستخدم الحساب نفسه هذا الاسم.</translation>
    </message>
    <message>
        <source>Names that begin with “.” and end in “.promise” are kept for promises.</source>
        <translation>الأسماء التي تبدأ بـ«&#x2068;.&#x2069;» وتنتهي بـ«&#x2068;.promise&#x2069;» محجوزة للعناصر النائبة.</translation>
    </message>
    <message>
        <source>Files on the device have the names that its promise would need.</source>
        <translation>تحمل ملفات على الجهاز الأسماء التي يحتاج إليها العنصر النائب.</translation>
    </message>
    <message>
        <source>Something else has that name on the device.</source>
        <translation>يحمل شيء آخر على الجهاز هذا الاسم.</translation>
    </message>
    <message>
        <source>A folder on the device has that name.</source>
        <translation>يحمل مجلد على الجهاز هذا الاسم.</translation>
    </message>
    <message>
        <source>A file on the device has that name.</source>
        <translation>يحمل ملف على الجهاز هذا الاسم.</translation>
    </message>
    <!-- What can go wrong with a file -->
    <message>
        <source>“%1$@” is no longer there. It may have been moved or deleted.</source>
        <translation>لم يعد «&#x2068;%1$@&#x2069;» موجودًا. ربما نُقل أو حُذف.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be used here.</source>
        <translation>لا يمكن استخدام «&#x2068;%1$@&#x2069;» هنا.</translation>
    </message>
    <message>
        <source>You do not have permission to read “%1$@”.</source>
        <translation>ليس لديك إذن بقراءة «&#x2068;%1$@&#x2069;».</translation>
    </message>
    <message>
        <source>“%1$@” is damaged and cannot be read.</source>
        <translation>«&#x2068;%1$@&#x2069;» تالف ولا يمكن قراءته.</translation>
    </message>
    <message>
        <source>“%1$@” could not be read or written because of a disk error.</source>
        <translation>تعذرت قراءة «&#x2068;%1$@&#x2069;» أو كتابته بسبب خطأ في القرص.</translation>
    </message>
    <message>
        <source>You do not have permission to change “%1$@”.</source>
        <translation>ليس لديك إذن بتغيير «&#x2068;%1$@&#x2069;».</translation>
    </message>
    <message>
        <source>The name “%1$@” cannot be used. Choose a different name.</source>
        <translation>لا يمكن استخدام الاسم «&#x2068;%1$@&#x2069;». اختر اسمًا آخر.</translation>
    </message>
    <message>
        <source>An item named “%1$@” already exists. Choose a different name.</source>
        <translation>يوجد بالفعل عنصر باسم «&#x2068;%1$@&#x2069;». اختر اسمًا آخر.</translation>
    </message>
    <message>
        <source>The name “%1$@” is too long. Choose a shorter one.</source>
        <translation>الاسم «&#x2068;%1$@&#x2069;» طويل جدًا. اختر اسمًا أقصر.</translation>
    </message>
    <message>
        <source>The folder “%1$@” is not empty.</source>
        <translation>المجلد «&#x2068;%1$@&#x2069;» ليس فارغًا.</translation>
    </message>
    <message>
        <source>There is not enough free space on the disk for “%1$@”. Free some space and try again.</source>
        <translation>لا توجد مساحة كافية على القرص لـ«&#x2068;%1$@&#x2069;». حرّر بعض المساحة وأعد المحاولة.</translation>
    </message>
    <message>
        <source>“%1$@” cannot be changed because its disk is read-only.</source>
        <translation>لا يمكن تغيير «&#x2068;%1$@&#x2069;» لأن قرصه للقراءة فقط.</translation>
    </message>
    <message>
        <source>The operation was cancelled.</source>
        <translation>أُلغيت العملية.</translation>
    </message>
    <message>
        <source>A file cannot take the place of a folder, nor a folder that of a file.</source>
        <translation>لا يمكن أن يحل ملف محل مجلد، ولا مجلد محل ملف.</translation>
    </message>
    <message>
        <source>The operation on “%1$@” took too long. Try again.</source>
        <translation>استغرقت العملية على «&#x2068;%1$@&#x2069;» وقتًا طويلًا. أعد المحاولة.</translation>
    </message>
    <message>
        <source>“%1$@” is in use. Close it elsewhere and try again.</source>
        <translation>«&#x2068;%1$@&#x2069;» قيد الاستخدام. أغلقه في مكان آخر وأعد المحاولة.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being read. Try again.</source>
        <translation>تغيّر «&#x2068;%1$@&#x2069;» أثناء قراءته. أعد المحاولة.</translation>
    </message>
    <message>
        <source>“%1$@” lies on another disk and has to be copied there.</source>
        <translation>يقع «&#x2068;%1$@&#x2069;» على قرص آخر ويجب نسخه إلى هناك.</translation>
    </message>
    <message>
        <source>The disk cannot swap “%1$@” and “%2$@”.</source>
        <translation>لا يستطيع القرص تبديل «&#x2068;%1$@&#x2069;» و«&#x2068;%2$@&#x2069;».</translation>
    </message>
    <message>
        <source>The disk that holds “%1$@” cannot keep this information.</source>
        <translation>لا يستطيع القرص الذي يحوي «&#x2068;%1$@&#x2069;» حفظ هذه المعلومات.</translation>
    </message>
    <!-- Starting, and being asked to open something -->
    <message>
        <source>Tavrin runs already and was asked to come forward.</source>
        <translation>&#x200f;Tavrin قيد التشغيل بالفعل وطُلب منه الظهور في المقدمة.</translation>
    </message>
    <message>
        <source>Tavrin runs already, but did not take the request: %1$@</source>
        <translation>&#x200f;Tavrin قيد التشغيل بالفعل، لكنه لم يقبل الطلب: %1$@</translation>
    </message>
    <message>
        <source>Tavrin runs already, but does not answer. Close its window or end it, and try again.</source>
        <translation>&#x200f;Tavrin قيد التشغيل بالفعل، لكنه لا يستجيب. أغلق نافذته أو أنهِه، ثم أعد المحاولة.</translation>
    </message>
    <message>
        <source>Tavrin is busy with other requests. Try again.</source>
        <translation>&#x200f;Tavrin مشغول بطلبات أخرى. أعد المحاولة.</translation>
    </message>
    <message>
        <source>Tavrin was started but does not answer.</source>
        <translation>شُغّل Tavrin لكنه لا يستجيب.</translation>
    </message>
    <message>
        <source>Tavrin could not start (exit status %1$@).</source>
        <translation>تعذر تشغيل Tavrin (رمز الخروج %1$@).</translation>
    </message>
    <message>
        <source>“%1$@” could not be started (%2$@). Install Tavrin again.</source>
        <translation>تعذر تشغيل «&#x2068;%1$@&#x2069;» (&#x2068;%2$@&#x2069;). ثبّت Tavrin من جديد.</translation>
    </message>
    <message>
        <source>“%1$@” is no address of the kind tavrinapp:…</source>
        <translation>«&#x2068;%1$@&#x2069;» ليس عنوانًا من النوع &#x2068;tavrinapp:…&#x2069;</translation>
    </message>
    <message>
        <source>More than %@ addresses at once are not taken.</source>
        <translation>لا يُقبل أكثر من %@ عنوان دفعة واحدة.</translation>
    </message>
    <message>
        <source>An address of more than %@ characters names no document.</source>
        <translation>العنوان الذي يزيد على %@ حرف لا يدل على مستند.</translation>
    </message>
    <message>
        <source>The request is damaged and was not taken.</source>
        <translation>الطلب تالف ولم يُقبل.</translation>
    </message>
    <message>
        <source>The folder “%1$@” belongs to somebody else. Remove it, or have it removed, and start again.</source>
        <translation>المجلد «&#x2068;%1$@&#x2069;» يخص شخصًا آخر. أزله أو اطلب إزالته، ثم شغّل البرنامج من جديد.</translation>
    </message>
    <!-- A WebDAV server -->
    <message>
        <source>This is not the address of a server. It begins with “https://”.</source>
        <translation>هذا ليس عنوان خادم. يبدأ العنوان بـ «https://».</translation>
    </message>
    <message>
        <source>The address of a WebDAV server begins with “https://” or “http://”.</source>
        <translation>يبدأ عنوان خادم WebDAV بـ «https://» أو «http://».</translation>
    </message>
    <message>
        <source>Give the user and the password apart from the address.</source>
        <translation>اكتب المستخدم وكلمة المرور منفصلين عن العنوان.</translation>
    </message>
    <message>
        <source>The address of a WebDAV folder has neither a “?” nor a “#” in it.</source>
        <translation>لا يحتوي عنوان مجلد WebDAV على «?» ولا «#».</translation>
    </message>
    <message>
        <source>The path in the address is not well-formed.</source>
        <translation>المسار في العنوان غير سليم.</translation>
    </message>
    <message>
        <source>The name is not valid UTF-8, and a WebDAV server takes no other.</source>
        <translation>الاسم ليس بترميز UTF-8 صحيح، ولا يقبل خادم WebDAV غيره.</translation>
    </message>
    <message>
        <source>The server does not list names that begin with a dot, so that the item would look deleted.</source>
        <translation>لا يعرض الخادم الأسماء التي تبدأ بنقطة، فيبدو العنصر محذوفًا.</translation>
    </message>
    <message>
        <source>The account on the server takes no changes; “%1$@” stays as it is there.</source>
        <translation>لا يقبل الحساب على الخادم أي تغيير؛ يبقى «%1$@» هناك كما هو.</translation>
    </message>
    <message>
        <source>The server replaces what stands at a name without being asked to. Nothing is changed on it.</source>
        <translation>يستبدل الخادم ما يحمل الاسم دون طلب. لن يُغيَّر عليه شيء.</translation>
    </message>
    <message>
        <source>“%1$@” was changed while it was being replaced. What was there lies at “%2$@” on the server.</source>
        <translation>تغيّر «%1$@» أثناء استبداله. ما كان هناك موجود في «%2$@» على الخادم.</translation>
    </message>
    <message>
        <source>The server's list of “%1$@” makes no sense. Nothing is concluded from it; it is asked again later.</source>
        <translation>قائمة الخادم لـ «%1$@» غير منطقية. لا يُستنتج منها شيء، ويُسأل الخادم لاحقًا.</translation>
    </message>
    <message>
        <source>The server's list of a folder is not whole or not well-formed. Nothing is concluded from it; it is asked again later.</source>
        <translation>قائمة المجلد من الخادم ناقصة أو غير سليمة. لا يُستنتج منها شيء، ويُسأل الخادم لاحقًا.</translation>
    </message>
    <message>
        <source>Its name is not valid UTF-8.</source>
        <translation>اسمه ليس بترميز UTF-8 صحيح.</translation>
    </message>
    <message>
        <source>The server does not allow it to be read.</source>
        <translation>لا يسمح الخادم بقراءته.</translation>
    </message>
    <message>
        <source>The server does not tell its size.</source>
        <translation>لا يذكر الخادم حجمه.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot be reached. Check the network and the address.</source>
        <translation>تعذّر الوصول إلى الخادم «%1$@». تحقق من الشبكة والعنوان.</translation>
    </message>
    <message>
        <source>The server “%1$@” cannot prove who it is: its certificate is not valid or not known here. Nothing was sent to it.</source>
        <translation>لا يستطيع الخادم «%1$@» إثبات هويته: شهادته غير صالحة أو غير معروفة هنا. لم يُرسل إليه شيء.</translation>
    </message>
    <message>
        <source>The server “%1$@” does not answer any more. It is tried again.</source>
        <translation>لم يعد الخادم «%1$@» يستجيب. ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>The connection to the server “%1$@” broke off. It is tried again.</source>
        <translation>انقطع الاتصال بالخادم «%1$@». ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>The server does not accept the user or the password. Sign in again.</source>
        <translation>لا يقبل الخادم المستخدم أو كلمة المرور. سجّل الدخول من جديد.</translation>
    </message>
    <message>
        <source>The server sends on to “%1$@”, which is not followed. Sign in with that address if it is the right one.</source>
        <translation>يحيل الخادم إلى «%1$@» ولا يُتَّبع ذلك. سجّل الدخول بهذا العنوان إن كان صحيحًا.</translation>
    </message>
    <message>
        <source>The server is busy and asks to be left alone for %1$@ seconds. Everything waits until then.</source>
        <translation>الخادم مشغول ويطلب الانتظار %1$@ ثانية. ينتظر كل شيء حتى ذلك الحين.</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be changed.</source>
        <translation>لا يسمح الخادم بتغيير «%1$@».</translation>
    </message>
    <message>
        <source>The server does not allow “%1$@” to be read.</source>
        <translation>لا يسمح الخادم بقراءة «%1$@».</translation>
    </message>
    <message>
        <source>The server takes no file as large as “%1$@”.</source>
        <translation>لا يقبل الخادم ملفًا بحجم «%1$@».</translation>
    </message>
    <message>
        <source>“%1$@” is locked on the server by another program. It is tried again.</source>
        <translation>«%1$@» مقفل على الخادم بواسطة برنامج آخر. ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>The server does not reach what stands behind it. It is tried again.</source>
        <translation>لا يصل الخادم إلى ما وراءه. ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>The server refused a request for “%1$@” (%2$@). It is tried again.</source>
        <translation>رفض الخادم طلبًا بشأن «%1$@» (%2$@). ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>The server sends “%1$@” in an encoding that was not asked for.</source>
        <translation>يرسل الخادم «%1$@» بترميز لم يُطلب.</translation>
    </message>
    <message>
        <source>What the server sent of “%1$@” does not have the checksum that the server gives. It is tried again.</source>
        <translation>ما أرسله الخادم من «%1$@» لا يطابق المجموع الذي يذكره. ستُعاد المحاولة.</translation>
    </message>
    <message>
        <source>What is at “%1$@” now is not what this account was linked with. Nothing is changed until it is back.</source>
        <translation>ما يوجد الآن في «%1$@» ليس ما رُبط به هذا الحساب. لن يُغيَّر شيء حتى يعود.</translation>
    </message>
    <message>
        <source>The name is too long for the server.</source>
        <translation>الاسم أطول مما يقبله الخادم.</translation>
    </message>
    <message>
        <source>The server answers for “%1$@”, and not as a WebDAV server does. Check the address: it is that of a folder, and often longer than that of the site.</source>
        <translation>يجيب الخادم عن «%1$@» لكن ليس كخادم WebDAV. تحقق من العنوان: فهو عنوان مجلد، وغالبًا أطول من عنوان الموقع.</translation>
    </message>
    <message>
        <source>There is nothing at “%1$@” on the server. Check the address.</source>
        <translation>لا يوجد شيء في «%1$@» على الخادم. تحقق من العنوان.</translation>
    </message>
    <message>
        <source>The server does not allow the folder “%1$@” to be read.</source>
        <translation>لا يسمح الخادم بقراءة المجلد «%1$@».</translation>
    </message>
    <message>
        <source>The server has a fault of its own and does not answer for “%1$@”. It is tried again.</source>
        <translation>في الخادم خلل ولا يجيب عن «%1$@». ستُعاد المحاولة.</translation>
    </message>
</context>
<!-- The menu of a text field is the toolkit's own. -->
<context>
    <name>QLineEdit</name>
    <message>
        <source>&amp;Undo</source>
        <translation>&amp;تراجع</translation>
    </message>
    <message>
        <source>&amp;Redo</source>
        <translation>إ&amp;عادة</translation>
    </message>
    <message>
        <source>Cu&amp;t</source>
        <translation>&amp;قص</translation>
    </message>
    <message>
        <source>&amp;Copy</source>
        <translation>&amp;نسخ</translation>
    </message>
    <message>
        <source>&amp;Paste</source>
        <translation>&amp;لصق</translation>
    </message>
    <message>
        <source>Delete</source>
        <translation>حذف</translation>
    </message>
    <message>
        <source>Select All</source>
        <translation>تحديد الكل</translation>
    </message>
</context>
</TS>
