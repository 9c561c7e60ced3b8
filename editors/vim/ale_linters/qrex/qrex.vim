call qrex_ale#Define('qrex')
